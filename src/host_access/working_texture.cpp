#include "host_access/working_texture.h"

namespace Plugin::host {
namespace {

// GL enums of the texture records, spelled out so that this layer needs no GL header.
constexpr uint32_t kGlFloat = 0x1406;
constexpr uint32_t kGlRgba = 0x1908;
constexpr uint32_t kGlRgba32F = 0x8814;

constexpr uint32_t kModeRenderDestination = 0;

vtpl::HostTexture defaultTexture() {
  vtpl::HostTexture texture{};
  texture.pixelType = kGlFloat;
  texture.format = kGlRgba;
  texture.factor1 = 1.0f;
  texture.factor2 = 1.0f;
  return texture;
}

// The record a working texture copies its format and pixel type from: the render's output in
// mode 0, the defaults otherwise. (The render record has no room for a texture record of its own:
// its texture scale sits four bytes after the place such a record would start.)
vtpl::HostTexture workingTemplate(const vtpl::HostEffectRecord& record) {
  const auto* render = static_cast<const vtpl::HostRenderRecord*>(record.messageRecord);
  if (record.modeValue == kModeRenderDestination && render != nullptr &&
      render->destination != nullptr) {
    return *render->destination;
  }
  return defaultTexture();
}

}  // namespace

LayerHandle acquireWorkingTexture(const HostCalls& host, uint32_t width, uint32_t height,
                                  bool wantFloat, bool hostFlag) {
  vtpl::HostTexture texture = workingTemplate(host.record());
  texture.width = width;
  texture.height = height;
  const uint32_t internalFormat =
      wantFloat && texture.format == kGlRgba ? kGlRgba32F : texture.format;
  uint32_t allocatedWidth = 0;
  uint32_t allocatedHeight = 0;
  const auto* render = static_cast<const vtpl::HostRenderRecord*>(host.record().messageRecord);
  texture.name = host.call(&vtpl::HostEffectRecord::allocateTexture, render, width, height,
                           internalFormat, kGlRgba, texture.pixelType, 0u, 0u, &allocatedWidth,
                           &allocatedHeight, static_cast<uint8_t>(hostFlag));
  texture.allocatedWidth = allocatedWidth;
  texture.allocatedHeight = allocatedHeight;
  texture.uMin = 0.0f;
  texture.vMin = 0.0f;
  // A host that allocated nothing leaves the rectangle empty rather than dividing by zero.
  texture.uMax = allocatedWidth > 0 ? static_cast<float>(width) / allocatedWidth : 0.0f;
  texture.vMax = allocatedHeight > 0 ? static_cast<float>(height) / allocatedHeight : 0.0f;
  return LayerHandle(host, host.record().messageRecord, texture);
}

}  // namespace Plugin::host

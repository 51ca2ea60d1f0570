#include "plugin/comparison_layer.h"

#include <cstring>

#include "plugin/parameter_ids.h"

namespace plugin::Scopes {
namespace {

using vtpl::HostEffectRecord;

constexpr char kNoLayer[] = "00000000-0000-0000-0000-000000000000";
// Layer kinds 0, 1, 4, 6 and 7 carry pixels.
constexpr uint32_t kKindsWithPixels = 0xD3;

}  // namespace

Plugin::host::LayerHandle fetchComparisonLayer(const Plugin::host::HostCalls& host, int32_t time,
                                               int32_t layerArgument, int32_t frameIndex,
                                               const void* releaseRecord) {
  char identifier[vtpl::kIdentifierChars + 1] = {};
  void* layer = host.call(&HostEffectRecord::getLayer, ParamId::kOverlayLayer, time, layerArgument,
                          identifier);
  const uint32_t mode = host.record().modeValue;
  if (std::memcmp(identifier, kNoLayer, vtpl::kIdentifierChars) == 0 || (mode != 0 && mode != 4)) {
    return {};
  }
  vtpl::HostLayerInfo info{};
  if (host.call(&HostEffectRecord::getLayerInfo, layer, time, &info) != vtpl::kStatusOk ||
      info.kind > 7 || (kKindsWithPixels & (1u << info.kind)) == 0 || frameIndex < 0 ||
      frameIndex >= info.frameCount) {
    return {};
  }
  vtpl::HostTexture texture{};
  const void* messageRecord = mode == 0 ? host.record().messageRecord : nullptr;
  if (host.call(&HostEffectRecord::fetchLayer, messageRecord, identifier, frameIndex, &texture) !=
      vtpl::kStatusOk) {
    return {};
  }
  return Plugin::host::LayerHandle(host, releaseRecord, texture);
}

}  // namespace plugin::Scopes

#include "scope/render_to_layer.h"

#include <algorithm>
#include <cmath>

#include "gl/pass_state_guard.h"
#include "gl/texture_units.h"
#include "host_access/working_texture.h"
#include "scope/blend_shader.h"
#include "scope/scope_composition.h"

namespace plugin::Scopes {
namespace {

using Plugin::host::HostCalls;

constexpr float kSmallestSide = 16.0f;

// The scope as the render-to-layer parameters ask for it: no black panel, labels in the render
// thread's text state.
ScopeDrawing layerScopeDrawing(const RenderToLayerSettings& settings,
                               const CompositionSettings& composition,
                               const ScopePlacement& placement) {
  ScopeDrawing drawing;
  drawing.composition = composition;
  const auto& [red, green, blue] = settings.backgroundColour;
  drawing.background = {red, green, blue, settings.backgroundAlpha};
  drawing.showGuidelines = settings.showGuidelines;
  drawing.showColourBars = settings.showColourBars;
  drawing.labels = {settings.showAxisLabels, settings.labelScale, settings.labelScale, false};
  drawing.width = placement.width;
  drawing.height = placement.height;
  return drawing;
}

}  // namespace

std::optional<ScopePlacement> placeScope(const FramePoint& topLeft, const FramePoint& bottomRight,
                                         float frameWidth, float frameHeight) {
  const float tlX = topLeft[0] + 0.5f * frameWidth;
  const float tlY = topLeft[1] + 0.5f * frameHeight;
  const float brX = bottomRight[0] + 0.5f * frameWidth;
  const float brY = bottomRight[1] + 0.5f * frameHeight;
  ScopePlacement placement{};
  placement.width = std::fabs(brX - tlX);
  placement.height = std::fabs(brY - tlY);
  const float textureWidth = std::ceil(placement.width);
  const float textureHeight = std::ceil(placement.height);
  // Also refuses areas no texture could hold, and NaN corners.
  constexpr float kLargestSide = 65536.0f;
  if (!(textureWidth >= kSmallestSide && textureHeight >= kSmallestSide &&
        textureWidth <= kLargestSide && textureHeight <= kLargestSide)) {
    return std::nullopt;
  }
  placement.textureWidth = static_cast<uint32_t>(textureWidth);
  placement.textureHeight = static_cast<uint32_t>(textureHeight);
  placement.left = std::min(tlX, brX);
  placement.right = std::max(tlX, brX);
  placement.bottom = std::min(tlY, brY);
  placement.top = std::max(tlY, brY);
  placement.mirrorX = tlX > brX;
  placement.mirrorY = brY > tlY;
  return placement;
}

std::array<float, 4> layerRectangle(const ScopePlacement& placement,
                                    const vtpl::HostTexture& layer) {
  const float width = static_cast<float>(std::max(layer.allocatedWidth, 1u));
  const float height = static_cast<float>(std::max(layer.allocatedHeight, 1u));
  return {placement.left / width * layer.factor1, placement.bottom / height * layer.factor2,
          placement.right / width * layer.factor1, placement.top / height * layer.factor2};
}

std::array<float, 4> scopeRectangle(const ScopePlacement& placement,
                                    const vtpl::HostTexture& scope) {
  const float u = placement.width / static_cast<float>(placement.textureWidth) * scope.uMax;
  const float v = placement.height / static_cast<float>(placement.textureHeight) * scope.vMax;
  std::array<float, 4> rectangle = {0, 0, u, v};
  if (placement.mirrorX) {
    std::swap(rectangle[0], rectangle[2]);
  }
  if (placement.mirrorY) {
    std::swap(rectangle[1], rectangle[3]);
  }
  return rectangle;
}

void renderToLayer(const HostCalls& host, Plugin::gl::EffectData& programs,
                   const ScopeWaveforms& waveforms, const vtpl::HostRenderRecord& frame,
                   const RenderToLayerSettings& settings, const CompositionSettings& composition) {
  if (frame.source == nullptr || frame.destination == nullptr || frame.projection == nullptr ||
      frame.modelView == nullptr) {
    return;
  }
  const std::optional<ScopePlacement> placement =
      placeScope(settings.topLeft, settings.bottomRight, static_cast<float>(frame.frameWidth),
                 static_cast<float>(frame.frameHeight));
  if (!placement) {
    return;
  }
  const Plugin::gl::PassStateGuard stateGuard;
  Plugin::host::LayerHandle scope = Plugin::host::acquireWorkingTexture(
      host, placement->textureWidth, placement->textureHeight, false, false);
  if (scope.empty()) {
    return;  // the host had no texture to give
  }
  Plugin::gl::attachTexture(scope.texture(), 0, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D);
  drawScope(host, programs, waveforms, layerScopeDrawing(settings, composition, *placement));

  Plugin::gl::attachTexture(*frame.destination, 0, GL_COLOR_ATTACHMENT0, GL_TEXTURE_2D);
  BlendPass pass;
  pass.layerTexture = frame.source->name;
  pass.scopeTexture = scope.texture().name;
  pass.mode = settings.blend;
  pass.quad = {placement->left, placement->bottom, placement->right, placement->top};
  pass.layerRect = layerRectangle(*placement, *frame.source);
  pass.scopeRect = scopeRectangle(*placement, scope.texture());
  pass.projection = frame.projection;
  pass.modelView = frame.modelView;
  drawBlendPass(host, programs, pass);

  glFlush();
  Plugin::gl::unbindTextureUnit(GL_TEXTURE1, GL_TEXTURE_2D, false);
  glActiveTexture(GL_TEXTURE0);
  scope.release();
}

}  // namespace plugin::Scopes

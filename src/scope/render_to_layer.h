// The scope rendered into the layer: drawn into a working texture of the size the two corner
// points span, then composited over the render's output with one of the blend modes.
#ifndef WAVEFORM_SCOPE_RENDER_TO_LAYER_H
#define WAVEFORM_SCOPE_RENDER_TO_LAYER_H

#include <array>
#include <cstdint>
#include <optional>

#include "gl/effect_data.h"
#include "gl/host_calls.h"
#include "scope/waveform_result.h"
#include "vtpl/host_interface.h"

namespace plugin::Scopes {

using FramePoint = std::array<float, 2>;  // x right, y up

// Where the scope goes in the frame, in frame pixels with the origin at the lower-left corner.
struct ScopePlacement {
  float left, bottom, right, top;
  float width, height;                   // the exact size of the area
  uint32_t textureWidth, textureHeight;  // the area rounded up: the working texture's size
  bool mirrorX;                          // the top-left point lies right of the bottom-right one
  bool mirrorY;                          // the bottom-right point lies above the top-left one
};

// The area between the two corner points, given relative to the frame's centre; none when it is
// less than 16 pixels wide or high.
std::optional<ScopePlacement> placeScope(const FramePoint& topLeft, const FramePoint& bottomRight,
                                         float frameWidth, float frameHeight);

// Texture coordinates (u0, v0, u1, v1) across the area: of the layer, within its allocation, and
// of the working texture holding the scope, reversed along a mirrored axis.
std::array<float, 4> layerRectangle(const ScopePlacement& placement,
                                    const vtpl::HostTexture& layer);
std::array<float, 4> scopeRectangle(const ScopePlacement& placement,
                                    const vtpl::HostTexture& scope);

// Draws the scope into the render's output over the area the parameters place it in, composited
// with `blend` over the render's source layer. Expects the output attached to the bound
// framebuffer and leaves it so.
void renderToLayer(const Plugin::gl::HostCalls& host, Plugin::gl::EffectData& programs,
                   const ScopeWaveforms& waveforms, const vtpl::HostRenderRecord& frame,
                   int32_t blend);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_RENDER_TO_LAYER_H

// The scope rendered into the layer: drawn into a working texture of the size the two corner
// points span, then composited over the render's output with one of the blend modes.
#ifndef WAVEFORM_SCOPE_RENDER_TO_LAYER_H
#define WAVEFORM_SCOPE_RENDER_TO_LAYER_H

#include <array>
#include <cstdint>
#include <optional>

#include "gl/effect_data.h"
#include "host_access/host_calls.h"
#include "scope/scope_settings.h"
#include "scope/waveform_result.h"
#include "vtpl/host_interface.h"

namespace plugin::Scopes {

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

// Draws the scope into the render's output over the area the settings place it in, composited
// with their blend mode over the render's source layer, through a working texture the host
// lends for the pass. Expects the output attached to the bound framebuffer and leaves it so.
void renderToLayer(const Plugin::host::HostCalls& host, Plugin::gl::EffectData& programs,
                   const ScopeWaveforms& waveforms, const vtpl::HostRenderRecord& frame,
                   const RenderToLayerSettings& settings, const CompositionSettings& composition);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_RENDER_TO_LAYER_H

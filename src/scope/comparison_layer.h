// The second layer a scope can compare with: chosen by "overlayLayer", fetched from the host.
#ifndef WAVEFORM_SCOPE_COMPARISON_LAYER_H
#define WAVEFORM_SCOPE_COMPARISON_LAYER_H

#include <cstdint>

#include "gl/host_calls.h"
#include "vtpl/host_interface.h"

namespace plugin::Scopes {

// The comparison layer's texture at the frame index, or an all-zero record when no usable layer
// is chosen (none, a kind without pixels, a frame outside the layer, or a host that cannot
// fetch it). A texture with a name must be handed back with releaseLayer.
vtpl::HostTexture fetchComparisonLayer(const Plugin::gl::HostCalls& host, int32_t time,
                                       int32_t layerArgument, int32_t frameIndex);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_COMPARISON_LAYER_H

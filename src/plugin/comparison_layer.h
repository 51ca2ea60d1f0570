// The second layer a scope can compare with: chosen by "overlayLayer", fetched from the host.
#ifndef WAVEFORM_PLUGIN_COMPARISON_LAYER_H
#define WAVEFORM_PLUGIN_COMPARISON_LAYER_H

#include <cstdint>

#include "host_access/host_calls.h"
#include "host_access/layer_handle.h"

namespace plugin::Scopes {

// The comparison layer's texture at the frame index, handed back when the handle goes; an empty
// handle when no usable layer is chosen (none, a kind without pixels, a frame outside the layer,
// or a host that cannot fetch it). `releaseRecord` is what the host gets back with it.
Plugin::host::LayerHandle fetchComparisonLayer(const Plugin::host::HostCalls& host, int32_t time,
                                               int32_t layerArgument, int32_t frameIndex,
                                               const void* releaseRecord);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_PLUGIN_COMPARISON_LAYER_H

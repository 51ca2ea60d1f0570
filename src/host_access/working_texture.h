// Working textures: scratch textures of a given size that the host allocates for the effect
// during a render and takes back when the handle goes.
#ifndef WAVEFORM_HOST_ACCESS_WORKING_TEXTURE_H
#define WAVEFORM_HOST_ACCESS_WORKING_TEXTURE_H

#include <cstdint>

#include "host_access/host_calls.h"
#include "host_access/layer_handle.h"

namespace Plugin::host {

// Asks the host for a working texture of this size, modelled on the texture the host record's
// mode value selects; float storage when asked for and the template is RGBA. A host that
// allocated nothing gives an empty handle's name 0 and an empty coordinate rectangle.
LayerHandle acquireWorkingTexture(const HostCalls& host, uint32_t width, uint32_t height,
                                  bool wantFloat, bool hostFlag);

}  // namespace Plugin::host

#endif  // WAVEFORM_HOST_ACCESS_WORKING_TEXTURE_H

// Moving pictures between host memory and the GL textures the host hands to effects. Textures
// hold premultiplied alpha with their first row at the bottom of the picture.
#ifndef VTPL_HOST_LAYER_TEXTURES_H
#define VTPL_HOST_LAYER_TEXTURES_H

#include <cstdint>

#include "image.h"
#include "vtpl/host_interface.h"

namespace vtpl::host {

// Storage of at least width x height: exactly that, or the next powers of two when padding, so
// that effects meet texture-coordinate rectangles smaller than the whole texture.
HostTexture allocateLayerTexture(uint32_t width, uint32_t height, bool asFloat, bool pad);
// A layer texture holding the picture, premultiplied; 8-bit RGBA or 32-bit float storage.
HostTexture uploadLayer(const Image& picture, bool asFloat, bool pad);
// The used area of a layer texture as a picture with straight alpha, at `bitDepth`.
Image readLayer(const HostTexture& texture, int bitDepth);
void deleteLayerTexture(HostTexture& texture);

}  // namespace vtpl::host

#endif  // VTPL_HOST_LAYER_TEXTURES_H

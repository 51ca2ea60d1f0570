// Forward declarations of the GL resource wrappers that instance and shared state hold by shared
// reference. Holders need only these; the passes that create the objects include the full types.
#ifndef WAVEFORM_GL_RESOURCE_TYPES_H
#define WAVEFORM_GL_RESOURCE_TYPES_H

#include <memory>
#include <vector>

namespace Plugin::gl {

class Texture;
class StencilRenderBuffer;

// Stencil buffers reused by the analysis passes of one instance.
using StencilBufferList = std::vector<std::shared_ptr<StencilRenderBuffer>>;

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_RESOURCE_TYPES_H

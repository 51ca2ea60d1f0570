// A minimal host render interface for GL tests: the callbacks the passes use (vertex array,
// buffers, working textures and their release), served with real GL objects in the test's
// context, and a record of what was asked.
#ifndef WAVEFORM_TESTS_GL_GL_TEST_HOST_H
#define WAVEFORM_TESTS_GL_GL_TEST_HOST_H

#include <cstdint>
#include <vector>

#include "gl/gl_api.h"
#include "host_access/host_calls.h"
#include "vtpl/host_interface.h"

namespace waveform_test {

struct AllocationRequest {
  uint32_t width, height, internalFormat, format, pixelType;
  uint8_t flag;
};

class GlTestHost {
 public:
  GlTestHost();
  ~GlTestHost();

  Plugin::host::HostCalls calls() { return Plugin::host::HostCalls(this, record_); }
  vtpl::HostEffectRecord& record() { return record_; }

  // allocateTexture answers with storage of at least this size (0: exactly the request).
  uint32_t allocatedWidth = 0;
  uint32_t allocatedHeight = 0;
  std::vector<AllocationRequest> allocations;
  std::vector<uint32_t> releasedLayers;  // texture names handed back with releaseLayer
  bool failBuffers = false;              // createBuffer throws, as a failing host callback would
  int buffersCreated = 0;
  int buffersReleased = 0;

 private:
  static GlTestHost& of(vtpl::HostContext context) { return *static_cast<GlTestHost*>(context); }
  static uint32_t vertexArray(vtpl::HostContext context);
  static uint32_t createBuffer(vtpl::HostContext context, uint32_t target, uint32_t size,
                               const void* data, uint32_t usage, uint32_t* out, int32_t);
  static void releaseBuffer(vtpl::HostContext context, uint32_t name);
  static void releaseLayer(vtpl::HostContext context, const void*, uint32_t name);
  static uint32_t allocateTexture(vtpl::HostContext context, const vtpl::HostRenderRecord*,
                                  uint32_t width, uint32_t height, uint32_t internalFormat,
                                  uint32_t format, uint32_t pixelType, uint32_t, uint32_t,
                                  uint32_t* allocatedWidth, uint32_t* allocatedHeight,
                                  uint8_t flag);

  vtpl::HostEffectRecord record_{};
  GLuint vertexArray_ = 0;
  std::vector<GLuint> textures_;
};

}  // namespace waveform_test

#endif  // WAVEFORM_TESTS_GL_GL_TEST_HOST_H

#include "gl_test_host.h"

#include <stdexcept>

namespace waveform_test {

GlTestHost::GlTestHost() {
  record_.vertexArray = vertexArray;
  record_.createBuffer = createBuffer;
  record_.releaseBuffer = releaseBuffer;
  record_.allocateTexture = allocateTexture;
  record_.releaseLayer = releaseLayer;
}

void GlTestHost::releaseLayer(vtpl::HostContext context, const void*, uint32_t name) {
  of(context).releasedLayers.push_back(name);
}

GlTestHost::~GlTestHost() {
  if (vertexArray_ != 0) {
    glDeleteVertexArrays(1, &vertexArray_);
  }
  if (!textures_.empty()) {
    glDeleteTextures(static_cast<GLsizei>(textures_.size()), textures_.data());
  }
}

uint32_t GlTestHost::vertexArray(vtpl::HostContext context) {
  GlTestHost& host = of(context);
  if (host.vertexArray_ == 0) {
    glGenVertexArrays(1, &host.vertexArray_);
  }
  return host.vertexArray_;
}

uint32_t GlTestHost::createBuffer(vtpl::HostContext context, uint32_t target, uint32_t size,
                                  const void* data, uint32_t usage, uint32_t* out, int32_t) {
  if (of(context).failBuffers) {
    throw std::runtime_error("createBuffer refused");
  }
  GLuint buffer = 0;
  glGenBuffers(1, &buffer);
  glBindBuffer(target, buffer);
  glBufferData(target, size, data, usage);
  glBindBuffer(target, 0);
  if (out != nullptr) {
    *out = buffer;
  }
  ++of(context).buffersCreated;
  return buffer;
}

void GlTestHost::releaseBuffer(vtpl::HostContext context, uint32_t name) {
  glDeleteBuffers(1, &name);
  ++of(context).buffersReleased;
}

uint32_t GlTestHost::allocateTexture(vtpl::HostContext context, const vtpl::HostRenderRecord*,
                                     uint32_t width, uint32_t height, uint32_t internalFormat,
                                     uint32_t format, uint32_t pixelType, uint32_t, uint32_t,
                                     uint32_t* allocatedWidth, uint32_t* allocatedHeight,
                                     uint8_t flag) {
  GlTestHost& host = of(context);
  host.allocations.push_back({width, height, internalFormat, format, pixelType, flag});
  *allocatedWidth = host.allocatedWidth != 0 ? host.allocatedWidth : width;
  *allocatedHeight = host.allocatedHeight != 0 ? host.allocatedHeight : height;
  GLuint texture = 0;
  glGenTextures(1, &texture);
  glBindTexture(GL_TEXTURE_2D, texture);
  glTexImage2D(GL_TEXTURE_2D, 0, static_cast<GLint>(internalFormat),
               static_cast<GLsizei>(*allocatedWidth), static_cast<GLsizei>(*allocatedHeight), 0,
               GL_RGBA, GL_FLOAT, nullptr);
  glBindTexture(GL_TEXTURE_2D, 0);
  host.textures_.push_back(texture);
  return texture;
}

}  // namespace waveform_test

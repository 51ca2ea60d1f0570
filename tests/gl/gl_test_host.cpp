#include "gl_test_host.h"

namespace waveform_test {

GlTestHost::GlTestHost() {
  record_.vertexArray = vertexArray;
  record_.createBuffer = createBuffer;
  record_.releaseBuffer = releaseBuffer;
  record_.allocateTexture = allocateTexture;
  record_.getInt = getInt;
  record_.getFloat = getFloat;
  record_.getAngle = getFloat;
  record_.getPoint = getPoint;
  record_.getBool = getBool;
  record_.getColor = getColor;
  record_.releaseLayer = releaseLayer;
}

std::array<float, 2> GlTestHost::value(vtpl::HostContext context, const char* id) {
  const auto& parameters = of(context).parameters;
  const auto found = parameters.find(id);
  return found != parameters.end() ? found->second : std::array<float, 2>{};
}

int32_t GlTestHost::getInt(vtpl::HostContext context, const char* id, int32_t) {
  return static_cast<int32_t>(value(context, id)[0]);
}

uint8_t GlTestHost::getBool(vtpl::HostContext context, const char* id, int32_t) {
  return value(context, id)[0] != 0 ? 1 : 0;
}

void GlTestHost::getColor(vtpl::HostContext context, const char* id, int32_t, float* red,
                          float* green, float* blue) {
  const auto& colours = of(context).colours;
  const auto found = colours.find(id);
  const std::array<float, 3> colour =
      found != colours.end() ? found->second : std::array<float, 3>{};
  *red = colour[0];
  *green = colour[1];
  *blue = colour[2];
}

void GlTestHost::releaseLayer(vtpl::HostContext context, const void*, uint32_t name) {
  of(context).releasedLayers.push_back(name);
}

float GlTestHost::getFloat(vtpl::HostContext context, const char* id, int32_t) {
  return value(context, id)[0];
}

void GlTestHost::getPoint(vtpl::HostContext context, const char* id, int32_t, float* x, float* y) {
  *x = value(context, id)[0];
  *y = value(context, id)[1];
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

#include "gl/texture.h"

#include <algorithm>
#include <cctype>
#include <string>

namespace Plugin::gl {
namespace {

bool isDepthFormat(GLenum internalFormat) {
  return internalFormat == GL_DEPTH_COMPONENT || internalFormat == GL_DEPTH_COMPONENT16 ||
         internalFormat == GL_DEPTH_COMPONENT24 || internalFormat == GL_DEPTH_COMPONENT32;
}

std::string lowerCaseGlString(GLenum which) {
  const auto* text = reinterpret_cast<const char*>(glGetString(which));
  std::string lower = text != nullptr ? text : "";
  std::transform(lower.begin(), lower.end(), lower.begin(),
                 [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
  return lower;
}

// These drivers need the producer's work finished, not only fenced, before another context
// samples the texture. Asked once per process.
bool driverNeedsFinishAfterFence() {
  static const bool needed = [] {
    const std::string vendor = lowerCaseGlString(GL_VENDOR);
    const std::string renderer = lowerCaseGlString(GL_RENDERER);
    for (const char* name : {"intel", "nvidia"}) {
      if (vendor.find(name) != std::string::npos || renderer.find(name) != std::string::npos) {
        return true;
      }
    }
    return false;
  }();
  return needed;
}

}  // namespace

std::shared_ptr<Texture> Texture::create() {
  return std::make_shared<Texture>();
}

Texture::Texture() {
  glGenTextures(1, &name_);
}

Texture::~Texture() {
  waitAndDeleteFence();
  glDeleteTextures(1, &name_);
}

void Texture::waitAndDeleteFence() {
  if (fence_ != nullptr) {
    glWaitSync(fence_, 0, GL_TIMEOUT_IGNORED);
    glDeleteSync(fence_);
    fence_ = nullptr;
  }
}

void Texture::define(GLuint width, GLuint height, GLenum internalFormat, float scale) {
  if (width != width_ || height != height_ || internalFormat != internalFormat_) {
    const GLenum pixelFormat = isDepthFormat(internalFormat) ? GL_DEPTH_COMPONENT : GL_RED;
    glActiveTexture(GL_TEXTURE0);
    glBindTexture(GL_TEXTURE_2D, name_);
    glTexImage2D(GL_TEXTURE_2D, 0, static_cast<GLint>(internalFormat), static_cast<GLsizei>(width),
                 static_cast<GLsizei>(height), 0, pixelFormat, GL_UNSIGNED_BYTE, nullptr);
    width_ = width;
    height_ = height;
    internalFormat_ = internalFormat;
  }
  scale_ = scale;
}

void Texture::placeFence() {
  waitAndDeleteFence();
  fence_ = glFenceSync(GL_SYNC_GPU_COMMANDS_COMPLETE, 0);
  if (driverNeedsFinishAfterFence()) {
    glFlush();
    glFinish();
  }
}

}  // namespace Plugin::gl

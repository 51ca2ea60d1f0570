// Helpers for the textures the host owns, described by HostTexture records, and the small
// matrix and quad arithmetic the passes share.
#ifndef WAVEFORM_GL_HOST_TEXTURES_H
#define WAVEFORM_GL_HOST_TEXTURES_H

#include <array>

#include "gl/gl_api.h"
#include "gl/host_calls.h"
#include "vtpl/host_interface.h"

namespace Plugin::gl {

using Matrix4 = std::array<float, 16>;       // column-major
using QuadVertices = std::array<float, 16>;  // four (x, y, u, v) vertices

// Attaches the texture to the bound framebuffer and sets the viewport to the level's size.
void attachTexture(const vtpl::HostTexture& texture, GLuint level, GLenum attachment,
                   GLenum target);
void bindTextureUnit(GLenum unit, GLenum target, GLuint name, bool linear);
void resetTextureUnit(GLenum unit, GLenum target, bool nearest);
void unbindTextureUnit(GLenum unit, GLenum target, bool nearest);

// A triangle strip over (0, 0)..(width, height) with the texture's coordinate rectangle.
QuadVertices textureQuad(const vtpl::HostTexture& texture, GLuint width, GLuint height);
// A triangle strip over (left, bottom)..(right, top), texture coordinates spanning 0..1 once.
QuadVertices rectangleQuad(float left, float bottom, float right, float top);

// B x A: A applied first, then B.
Matrix4 multiplyMatrices(const Matrix4& a, const Matrix4& b);

inline constexpr Matrix4 kIdentityMatrix = {1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1};
// Maps (0, 0)..(width, height) onto the whole viewport, depth -1 to 1.
Matrix4 orthographicMatrix(float width, float height);
// Maps (left, bottom)..(right, top) onto the whole viewport, depth -1 to 1.
Matrix4 orthographicMatrix(float left, float right, float bottom, float top);

// Asks the host for a working texture of this size, modelled on the texture the host record's
// mode value selects; float storage when asked for and the template is RGBA.
vtpl::HostTexture acquireWorkingTexture(const HostCalls& host, GLuint width, GLuint height,
                                        bool wantFloat, bool hostFlag);

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_HOST_TEXTURES_H

// The small matrix and quad arithmetic the passes share: column-major 4x4 matrices and the
// four (x, y, u, v) vertices of a textured rectangle.
#ifndef WAVEFORM_GL_QUAD_MATHS_H
#define WAVEFORM_GL_QUAD_MATHS_H

#include <array>
#include <cstdint>

#include "vtpl/host_interface.h"

namespace Plugin::gl {

using Matrix4 = std::array<float, 16>;       // column-major
using QuadVertices = std::array<float, 16>;  // four (x, y, u, v) vertices

// A triangle strip over (0, 0)..(width, height) with the texture's coordinate rectangle.
QuadVertices textureQuad(const vtpl::HostTexture& texture, uint32_t width, uint32_t height);
// A triangle strip over (left, bottom)..(right, top), texture coordinates spanning 0..1 once.
QuadVertices rectangleQuad(float left, float bottom, float right, float top);

// B x A: A applied first, then B.
Matrix4 multiplyMatrices(const Matrix4& a, const Matrix4& b);

inline constexpr Matrix4 kIdentityMatrix = {1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1, 0, 0, 0, 0, 1};
// Maps (0, 0)..(width, height) onto the whole viewport, depth -1 to 1.
Matrix4 orthographicMatrix(float width, float height);
// Maps (left, bottom)..(right, top) onto the whole viewport, depth -1 to 1.
Matrix4 orthographicMatrix(float left, float right, float bottom, float top);

}  // namespace Plugin::gl

#endif  // WAVEFORM_GL_QUAD_MATHS_H

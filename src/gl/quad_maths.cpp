#include "gl/quad_maths.h"

namespace Plugin::gl {

QuadVertices textureQuad(const vtpl::HostTexture& t, uint32_t width, uint32_t height) {
  const auto w = static_cast<float>(width);
  const auto h = static_cast<float>(height);
  return {0, 0, t.uMin, t.vMin, w, 0, t.uMax, t.vMin, 0, h, t.uMin, t.vMax, w, h, t.uMax, t.vMax};
}

QuadVertices rectangleQuad(float left, float bottom, float right, float top) {
  return {left, bottom, 0, 0, right, bottom, 1, 0, left, top, 0, 1, right, top, 1, 1};
}

Matrix4 multiplyMatrices(const Matrix4& a, const Matrix4& b) {
  Matrix4 product{};
  for (int column = 0; column < 4; ++column) {
    for (int row = 0; row < 4; ++row) {
      float sum = 0;
      for (int k = 0; k < 4; ++k) {
        sum += b[k * 4 + row] * a[column * 4 + k];
      }
      product[column * 4 + row] = sum;
    }
  }
  return product;
}

Matrix4 orthographicMatrix(float width, float height) {
  return orthographicMatrix(0, width, 0, height);
}

Matrix4 orthographicMatrix(float left, float right, float bottom, float top) {
  const float width = right - left;
  const float height = top - bottom;
  Matrix4 projection{};  // column-major
  projection[0] = 2.0f / width;
  projection[5] = 2.0f / height;
  projection[10] = -1.0f;
  projection[12] = -(right + left) / width;
  projection[13] = -(top + bottom) / height;
  projection[15] = 1.0f;
  return projection;
}

}  // namespace Plugin::gl

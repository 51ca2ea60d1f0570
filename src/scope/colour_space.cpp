#include "scope/colour_space.h"

#include <cstddef>

#include "scope/parameter_choices.h"

namespace plugin::Scopes {
namespace {

constexpr ColourSpaceMatrices kRec601Matrices = {
    {{{0.299, 0.587, 0.114},
      {-0.1687358916478555, -0.3312641083521444, 0.5},
      {0.5, -0.4186875891583452, -0.0813124108416548}}},
    {{{1.0, 0.0, 1.402}, {1.0, -0.344136, -0.714136}, {1.0, 1.772, 0.0}}},
};

constexpr ColourSpaceMatrices kRec709Matrices = {
    {{{0.2126, 0.7152, 0.0722},
      {-0.1145721060573399, -0.38542789394266, 0.5},
      {0.5, -0.4541529083058166, -0.0458470916941834}}},
    {{{1.0, 0.0, 1.5748}, {1.0, -0.187324, -0.468124}, {1.0, 1.8556, 0.0}}},
};

constexpr ColourSpaceMatrices kRec2020Matrices = {
    {{{0.2627, 0.678, 0.0593},
      {-0.1396300627192516, -0.3603699372807484, 0.5},
      {0.5, -0.4597857045978571, -0.040214295402143}}},
    {{{1.0, 0.0, 1.4746}, {1.0, -0.164553, -0.571353}, {1.0, 1.8814, 0.0}}},
};

Vector3 multiply(const Matrix3& m, const Vector3& v) {
  Vector3 result{};
  for (size_t row = 0; row < 3; ++row) {
    result[row] = m[row][0] * v[0] + m[row][1] * v[1] + m[row][2] * v[2];
  }
  return result;
}

}  // namespace

const ColourSpaceMatrices* colourSpaceMatrices(int32_t colorSpace) {
  switch (colorSpace) {
    case kRec601:
      return &kRec601Matrices;
    case kRec709:
      return &kRec709Matrices;
    case kRec2020:
      return &kRec2020Matrices;
    default:
      return nullptr;
  }
}

Vector3 rgbToYCbCr(int32_t colorSpace, const Vector3& rgb) {
  const ColourSpaceMatrices* matrices = colourSpaceMatrices(colorSpace);
  return matrices != nullptr ? multiply(matrices->toYCbCr, rgb) : Vector3{};
}

Vector3 yCbCrToRgb(int32_t colorSpace, const Vector3& yCbCr) {
  const ColourSpaceMatrices* matrices = colourSpaceMatrices(colorSpace);
  return matrices != nullptr ? multiply(matrices->toRgb, yCbCr) : Vector3{};
}

}  // namespace plugin::Scopes

// Luma and colour differences after Rec. 601, Rec. 709 and Rec. 2020, both ways. Any other
// colour-space number converts everything to zero.
#ifndef WAVEFORM_SCOPE_COLOUR_SPACE_H
#define WAVEFORM_SCOPE_COLOUR_SPACE_H

#include <array>
#include <cstdint>

namespace plugin::Scopes {

using Vector3 = std::array<double, 3>;
using Matrix3 = std::array<Vector3, 3>;  // rows

struct ColourSpaceMatrices {
  Matrix3 toYCbCr;  // rows Y, Cb, Cr from (r, g, b); Cb and Cr without offset
  Matrix3 toRgb;    // rows r, g, b from (Y, Cb, Cr)
};

// Null for a number other than 601, 709 or 2020.
const ColourSpaceMatrices* colourSpaceMatrices(int32_t colorSpace);

Vector3 rgbToYCbCr(int32_t colorSpace, const Vector3& rgb);
Vector3 yCbCrToRgb(int32_t colorSpace, const Vector3& yCbCr);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_COLOUR_SPACE_H

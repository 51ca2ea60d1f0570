// Turns a FreeType glyph into curves: the outline of one glyph of a face, at the face's current
// pixel size, as contours of straight, quadratic and cubic segments in pixels (y up), with the
// face's vertical metrics in em. The font object calls it on its current face; nothing is
// rasterised here.
#ifndef WAVEFORM_FONTS_GLYPH_CONVERSION_H
#define WAVEFORM_FONTS_GLYPH_CONVERSION_H

#include <cstdint>
#include <string>

#include "geometry/curves.h"

// FreeType's own handle type, declared here so that this header does not pull in FreeType.
struct FT_FaceRec_;
typedef struct FT_FaceRec_* FT_Face;

namespace vesk::plugin::lib {

// How the font flattens the curves of a converted glyph: reset to these values whenever a glyph
// is converted.
struct FlatteningParameters {
  float steps = 10.0f;
  float step = 0.1f;
  float step2 = 0.01f;
  float step3 = 0.001f;
};

// A 26.6 fixed-point coordinate in pixels: the truncated quotient by 64 plus the signed
// remainder in 64ths (-1 -> -0.015625, -65 -> -1.015625).
float fixed26Dot6ToFloat(long value);

// The descriptor of glyph `glyphIndex` of `face`, whose pixel size the caller has set to
// `pixelSize`. `filePath` and `faceIndex` name the face's font and are only recorded. A glyph
// that FreeType cannot load, or that has no outline, has no contours; the metrics are always
// filled (zero for a face without units per em). Throws std::invalid_argument for a null face.
GlyphDescriptor convertGlyph(FT_Face face, uint32_t glyphIndex, float pixelSize,
                             const std::u16string& filePath, uint32_t faceIndex);

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_FONTS_GLYPH_CONVERSION_H

// The HarfBuzz objects the font object shapes with: one buffer reused for every run, and one
// HarfBuzz font made from the current FreeType face through HarfBuzz's FreeType integration, so
// that glyph lookup and metrics come from the same face as the outlines. The font is recreated
// only when another face is bound.
#ifndef WAVEFORM_FONTS_HARFBUZZ_WRAPPER_H
#define WAVEFORM_FONTS_HARFBUZZ_WRAPPER_H

#include <cstdint>
#include <vector>

// FreeType's and HarfBuzz's own handle types, declared here so that this header pulls in neither.
struct FT_FaceRec_;
typedef struct FT_FaceRec_* FT_Face;
struct hb_buffer_t;
struct hb_font_t;

namespace vesk::plugin::lib {

// HarfBuzz's glyph information record, field for field: the glyph index after shaping, the
// mask, the cluster (index of the first code point of the glyph's cluster) and two private words.
struct ShapedGlyphInfo {
  uint32_t glyphIndex;
  uint32_t mask;
  uint32_t cluster;
  uint32_t var1;
  uint32_t var2;
};

// HarfBuzz's glyph position record, field for field, in 1/64 pixel of the face's current size.
struct ShapedGlyphPosition {
  int32_t xAdvance;
  int32_t yAdvance;
  int32_t xOffset;
  int32_t yOffset;
  uint32_t var;
};

// One output glyph: both records copied unchanged from the buffer.
struct ShapedGlyph {
  ShapedGlyphInfo info;
  ShapedGlyphPosition position;
};

class HarfBuzzWrapper {
 public:
  // With `verbose`, HarfBuzz's messages while shaping are written to standard output, each as
  // "HB Message: " and the message; without it, nothing is written.
  explicit HarfBuzzWrapper(bool verbose = false);
  ~HarfBuzzWrapper();
  HarfBuzzWrapper(const HarfBuzzWrapper&) = delete;
  HarfBuzzWrapper& operator=(const HarfBuzzWrapper&) = delete;

  // Follows the host's verbose flag; takes effect from the next run shaped.
  void setVerbose(bool verbose);
  bool verbose() const { return verbose_; }

  // Binds the HarfBuzz font to `face` (not owned), keeping the font when it is already made from
  // that face. A null face releases the font.
  void setFace(FT_Face face);
  // Destroys the font and forgets the face.
  void releaseFont();
  // HarfBuzz takes over the face's current size and variation coordinates.
  void fontSizeChanged();

  // Shapes a run of UTF-32 code points at bidirectional embedding level `bidiLevel`: left to
  // right at even levels, right to left at odd ones; script and language are guessed from the
  // text. Without a bound face the run gives no glyphs.
  void shape(const std::vector<uint32_t>& codePoints, uint8_t bidiLevel);
  // The glyphs of the last run shaped, in buffer (visual) order.
  std::vector<ShapedGlyph> shapedGlyphs() const;

  // How many HarfBuzz fonts this wrapper has made: shows that rebinding a face keeps its font.
  uint32_t fontCreations() const { return fontCreations_; }

 private:
  int32_t bufferClean_ = 1;
  hb_buffer_t* buffer_ = nullptr;
  hb_font_t* font_ = nullptr;
  FT_Face face_ = nullptr;
  bool verbose_ = false;
  uint32_t fontCreations_ = 0;
};

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_FONTS_HARFBUZZ_WRAPPER_H

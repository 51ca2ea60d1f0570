#include "fonts/harfbuzz_wrapper.h"

#include <ft2build.h>
#include FT_FREETYPE_H
#include <hb-ft.h>
#include <hb.h>

#include <cstddef>
#include <cstdio>
#include <cstring>

namespace vesk::plugin::lib {

// The output records are copied byte for byte from HarfBuzz's, so their layouts must agree.
static_assert(sizeof(ShapedGlyphInfo) == sizeof(hb_glyph_info_t));
static_assert(offsetof(ShapedGlyphInfo, cluster) == offsetof(hb_glyph_info_t, cluster));
static_assert(sizeof(ShapedGlyphPosition) == sizeof(hb_glyph_position_t));
static_assert(offsetof(ShapedGlyphPosition, xOffset) == offsetof(hb_glyph_position_t, x_offset));
static_assert(offsetof(ShapedGlyphPosition, yOffset) == offsetof(hb_glyph_position_t, y_offset));

namespace {

// Once installed, HarfBuzz calls this for every lookup it applies (dozens of lines for a short
// label), which is why it is installed only while the host asks for verbose output.
hb_bool_t writeMessage(hb_buffer_t*, hb_font_t* font, const char* message, void*) {
  if (message == nullptr) {
    return true;
  }
  std::printf("HB Message: %s\n", message);
  if (font == nullptr) {
    std::printf("    HB font is null\n");
  }
  return true;
}

}  // namespace

HarfBuzzWrapper::HarfBuzzWrapper(bool verbose) : buffer_(hb_buffer_create()) {
  setVerbose(verbose);
}

HarfBuzzWrapper::~HarfBuzzWrapper() {
  releaseFont();
  hb_buffer_destroy(buffer_);
}

void HarfBuzzWrapper::setVerbose(bool verbose) {
  verbose_ = verbose;
  hb_buffer_set_message_func(buffer_, verbose ? writeMessage : nullptr, nullptr, nullptr);
}

void HarfBuzzWrapper::setFace(FT_Face face) {
  if (face == nullptr) {
    releaseFont();
    return;
  }
  if (font_ != nullptr && face_ == face && hb_ft_font_get_face(font_) == face) {
    return;
  }
  releaseFont();
  face_ = face;
  font_ = hb_ft_font_create_referenced(face);
  ++fontCreations_;
}

void HarfBuzzWrapper::releaseFont() {
  if (font_ != nullptr) {
    hb_font_destroy(font_);
  }
  font_ = nullptr;
  face_ = nullptr;
}

void HarfBuzzWrapper::fontSizeChanged() {
  if (font_ != nullptr) {
    hb_ft_font_changed(font_);
  }
}

void HarfBuzzWrapper::shape(const std::vector<uint32_t>& codePoints, uint8_t bidiLevel) {
  if (bufferClean_ == 0) {
    hb_buffer_clear_contents(buffer_);
    bufferClean_ = 1;
  }
  // HarfBuzz's empty font would hand the code points back as glyph ids; without a face there
  // are no glyphs to give.
  if (font_ == nullptr) {
    return;
  }
  const int length = static_cast<int>(codePoints.size());
  hb_buffer_add_utf32(buffer_, codePoints.data(), length, 0, length);
  hb_buffer_guess_segment_properties(buffer_);
  bufferClean_ = 0;
  // The embedding level decides the direction, whatever the script would suggest.
  hb_buffer_set_direction(buffer_, (bidiLevel & 1) != 0 ? HB_DIRECTION_RTL : HB_DIRECTION_LTR);
  hb_shape(font_, buffer_, nullptr, 0);
}

std::vector<ShapedGlyph> HarfBuzzWrapper::shapedGlyphs() const {
  unsigned count = 0;
  const hb_glyph_info_t* infos = hb_buffer_get_glyph_infos(buffer_, &count);
  const hb_glyph_position_t* positions = hb_buffer_get_glyph_positions(buffer_, nullptr);
  std::vector<ShapedGlyph> glyphs(count);
  for (unsigned i = 0; i < count; ++i) {
    std::memcpy(&glyphs[i].info, &infos[i], sizeof(ShapedGlyphInfo));
    std::memcpy(&glyphs[i].position, &positions[i], sizeof(ShapedGlyphPosition));
  }
  return glyphs;
}

}  // namespace vesk::plugin::lib

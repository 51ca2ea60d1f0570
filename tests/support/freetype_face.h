// One face of a font file opened with FreeType (with a library of its own), closed with the
// object: the outside reference the font and glyph tests compare with.
#ifndef WAVEFORM_TESTS_SUPPORT_FREETYPE_FACE_H
#define WAVEFORM_TESTS_SUPPORT_FREETYPE_FACE_H

#include <ft2build.h>
#include FT_FREETYPE_H

#include <string>

namespace waveform_test {

class FreeTypeFace {
 public:
  // Null when FreeType cannot open the face; a pixel size of 0 sets none.
  explicit FreeTypeFace(const std::string& path, long faceIndex = 0, unsigned pixelSize = 0) {
    if (FT_Init_FreeType(&library_) != 0 ||
        FT_New_Face(library_, path.c_str(), faceIndex, &face_) != 0) {
      face_ = nullptr;
    } else if (pixelSize != 0) {
      FT_Set_Pixel_Sizes(face_, 0, pixelSize);
    }
  }
  ~FreeTypeFace() {
    if (face_ != nullptr) {
      FT_Done_Face(face_);
    }
    FT_Done_FreeType(library_);
  }
  FreeTypeFace(const FreeTypeFace&) = delete;
  FreeTypeFace& operator=(const FreeTypeFace&) = delete;

  FT_Face get() const { return face_; }
  FT_Face operator->() const { return face_; }
  FT_Library library() const { return library_; }

 private:
  FT_Library library_ = nullptr;
  FT_Face face_ = nullptr;
};

}  // namespace waveform_test

#endif  // WAVEFORM_TESTS_SUPPORT_FREETYPE_FACE_H

#include "freetype_face.h"

namespace waveform_test {

FreeTypeFace::FreeTypeFace(const std::string& path, long faceIndex, unsigned pixelSize) {
  if (FT_Init_FreeType(&library_) != 0 ||
      FT_New_Face(library_, path.c_str(), faceIndex, &face_) != 0) {
    face_ = nullptr;
  } else if (pixelSize != 0) {
    FT_Set_Pixel_Sizes(face_, 0, pixelSize);
  }
}

FreeTypeFace::~FreeTypeFace() {
  if (face_ != nullptr) {
    FT_Done_Face(face_);
  }
  if (library_ != nullptr) {
    FT_Done_FreeType(library_);
  }
}

}  // namespace waveform_test

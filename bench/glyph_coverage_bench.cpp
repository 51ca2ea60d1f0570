// Measures how well the glyph triangles match FreeType's anti-aliased rendering: for every glyph
// of each font at 48 pixels, the wrongly covered area over FreeType's inked area (see
// tests/support/glyph_coverage.h). Prints per font the mean, the worst glyph and how many glyphs
// pass a limit, and with --list every glyph past it.
//   glyph_coverage_bench [--list] [--limit=0.1] [FONT_FILE...]   (default: every TrueType and
//   OpenType face fontconfig lists)
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "freetype_face.h"
#include "glyph_coverage.h"
#include "listed_outline_faces.h"

namespace {

struct FontFace {
  std::string path;
  int index = 0;
};

// Every TrueType and OpenType face fontconfig lists, a variable face at its default instance.
std::vector<FontFace> installedFaces() {
  std::vector<FontFace> faces;
  for (const auto& [path, index] : waveform_test::listedOutlineFaces()) {
    faces.push_back({path, index});
  }
  return faces;
}

}  // namespace

int main(int argc, char** argv) {
  bool list = false;
  double limit = 0.1;
  std::vector<FontFace> fonts;
  for (int i = 1; i < argc; ++i) {
    const std::string argument = argv[i];
    if (argument == "--list") {
      list = true;
    } else if (argument.rfind("--limit=", 0) == 0) {
      limit = std::atof(argument.c_str() + 8);
    } else {
      fonts.push_back({argument, 0});
    }
  }
  if (fonts.empty()) {
    fonts = installedFaces();
  }
  int status = 0;
  for (const auto& [path, index] : fonts) {
    const waveform_test::FreeTypeFace face(path, index, 48);
    if (face.get() == nullptr) {
      std::fprintf(stderr, "glyph_coverage_bench: cannot open %s\n", path.c_str());
      status = 1;
      continue;
    }
    double sum = 0, worst = -1;
    long inked = 0, over = 0, worstGlyph = -1;
    for (FT_Long glyph = 0; glyph < face->num_glyphs; ++glyph) {
      const waveform_test::CoverageError error =
          waveform_test::glyphCoverageError(face.get(), static_cast<uint32_t>(glyph), 48);
      if (error.inked <= 0) {
        continue;
      }
      ++inked;
      sum += error.ratio();
      if (error.ratio() > worst) {
        worst = error.ratio();
        worstGlyph = glyph;
      }
      if (error.ratio() > limit) {
        ++over;
        if (list) {
          std::printf("  glyph %ld: %.1f %%\n", glyph, 100 * error.ratio());
        }
      }
    }
    std::printf(
        "%s#%d: %ld inked glyphs, mean %.2f %%, worst %.1f %% (glyph %ld), %ld over %.0f %%\n",
        path.c_str(), index, inked, inked > 0 ? 100 * sum / inked : 0.0, 100 * worst, worstGlyph,
        over, 100 * limit);
  }
  return status;
}

// Measures how well the glyph triangles match FreeType's anti-aliased rendering: for every glyph
// of each font at 48 pixels, the wrongly covered area over FreeType's inked area (see
// tests/support/glyph_coverage.h). Prints per font the mean, the worst glyph and how many glyphs
// pass a limit, and with --list every glyph past it.
//   glyph_coverage_bench [--list] [--limit=0.1] [FONT_FILE...]   (default: the fonts setup.sh
//   installs)
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include "freetype_face.h"
#include "glyph_coverage.h"

namespace {

const char* const kDefaultFonts[] = {
    "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf",
    "/usr/share/fonts/truetype/dejavu/DejaVuSans-Bold.ttf",
    "/usr/share/fonts/truetype/dejavu/DejaVuSansMono.ttf",
    "/usr/share/fonts/truetype/dejavu/DejaVuSansMono-Bold.ttf",
    "/usr/share/fonts/truetype/dejavu/DejaVuSerif.ttf",
    "/usr/share/fonts/truetype/dejavu/DejaVuSerif-Bold.ttf",
    "/usr/share/fonts/opentype/cantarell/Cantarell-Thin.otf",
    "/usr/share/fonts/opentype/cantarell/Cantarell-Light.otf",
    "/usr/share/fonts/opentype/cantarell/Cantarell-Regular.otf",
    "/usr/share/fonts/opentype/cantarell/Cantarell-Bold.otf",
    "/usr/share/fonts/opentype/cantarell/Cantarell-ExtraBold.otf",
    "/usr/share/fonts/truetype/inter-vf/Inter.var.ttf",
    "/usr/share/fonts/truetype/inter-vf/Inter-roman.var.ttf",
    "/usr/share/fonts/truetype/inter-vf/Inter-italic.var.ttf",
    "/usr/share/fonts/truetype/inter-vf/InterDisplay.var.ttf",
    "/usr/share/fonts/truetype/inter-vf/InterDisplay-roman.var.ttf",
    "/usr/share/fonts/truetype/inter-vf/InterDisplay-italic.var.ttf",
    "/usr/share/fonts/truetype/wqy/wqy-microhei.ttc",
};

}  // namespace

int main(int argc, char** argv) {
  bool list = false;
  double limit = 0.1;
  std::vector<std::string> fonts;
  for (int i = 1; i < argc; ++i) {
    const std::string argument = argv[i];
    if (argument == "--list") {
      list = true;
    } else if (argument.rfind("--limit=", 0) == 0) {
      limit = std::atof(argument.c_str() + 8);
    } else {
      fonts.push_back(argument);
    }
  }
  if (fonts.empty()) {
    fonts.assign(std::begin(kDefaultFonts), std::end(kDefaultFonts));
  }
  int status = 0;
  for (const std::string& path : fonts) {
    const waveform_test::FreeTypeFace face(path, 0, 48);
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
    std::printf("%s: %ld inked glyphs, mean %.2f %%, worst %.1f %% (glyph %ld), %ld over %.0f %%\n",
                path.c_str(), inked, inked > 0 ? 100 * sum / inked : 0.0, 100 * worst, worstGlyph,
                over, 100 * limit);
  }
  return status;
}

// The scope's graticule as numbers: the IRE guidelines with their label texts, and the places of
// the markers at the luma levels of 75 % colour bars.
#ifndef WAVEFORM_SCOPE_GUIDELINES_H
#define WAVEFORM_SCOPE_GUIDELINES_H

#include <array>
#include <cstdint>
#include <string>
#include <vector>

namespace plugin::Scopes {

struct Guideline {
  float y;               // in pixels of the scope's drawing height, 0 at its bottom
  std::u16string label;  // the IRE level in decimal
};
using GuidelineList = std::vector<Guideline>;

// `extended`: the waveform of a float layer, which spans -20 to 120 IRE; otherwise 0 to 100 IRE
// fill the height. `spacing`: the smallest distance between lines the labels need, in pixels.
// Lines run from the top down: above 100 IRE, 100 to 0, then below 0.
GuidelineList buildGuidelines(bool extended, float spacing, float height);

// Where a scope of `height` pixels draws a luma value.
float lumaHeight(float luma, bool extended, float height);

struct ColourBar {
  std::array<float, 3> rgb;
};
// Left to right: grey, white, yellow, cyan, green, magenta, red, blue, grey at 75 %.
const std::array<ColourBar, 9>& colourBars();

struct ColourBarMarker {
  float left, right;  // horizontal extent, in the scope's pixels
  float y;            // the bar's luma height
  std::array<float, 3> rgb;
};

// The markers over a panel from `left` to `right` for a waveform of a frame of frameWidth x
// frameHeight analysed at `textureScale`: nine bars of equal width centred on the panel, which on
// a 16:9 frame exactly span it, each marking its bar's luma in `colorSpace`. Bars outside the
// panel are left out and the outer ones cut at its edges. None for an unknown colour space.
std::vector<ColourBarMarker> colourBarMarkers(int32_t colorSpace, bool extended, float frameWidth,
                                              float frameHeight, float textureScale, float left,
                                              float right, float height);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_GUIDELINES_H

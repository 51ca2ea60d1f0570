#include "scope/guidelines.h"

#include <algorithm>

#include "scope/colour_space.h"

namespace plugin::Scopes {
namespace {

// Heights of 120, 100, 0 and -20 IRE in an extended scope, as parts of its height.
constexpr float kExtendedTop = 0.9666667f;
constexpr float kExtendedWhite = 0.8333333f;
constexpr float kExtendedBlack = 0.16666667f;
constexpr float kExtendedBottom = 0.033333335f;

// The largest of 10, 5, 4, 2 and 1 lines that fit `room` (room counted in label spacings).
int mainDivisions(float room) {
  for (const int divisions : {10, 5, 4, 2}) {
    if (room >= static_cast<float>(divisions)) {
      return divisions;
    }
  }
  return 1;
}

// Two lines beyond 100 or 0 IRE when they fit, one when only one fits, else none.
int outerDivisions(float room) {
  return room >= 2.0f ? 2 : room >= 1.0f ? 1 : 0;
}

std::u16string decimal(int value) {
  const std::string text = std::to_string(value);
  return std::u16string(text.begin(), text.end());
}

}  // namespace

GuidelineList buildGuidelines(bool extended, float spacing, float height) {
  const float top = extended ? kExtendedTop * height : height;
  const float white = extended ? kExtendedWhite * height : height;
  const float black = extended ? kExtendedBlack * height : 0.0f;
  const float bottom = extended ? kExtendedBottom * height : 0.0f;
  const int main = mainDivisions((white - black) / spacing * 0.5f);
  const int above = outerDivisions((top - white) / spacing * 0.5f);
  const int below = outerDivisions((black - bottom) / spacing * 0.5f);

  GuidelineList lines;
  for (int k = above; k >= 1; --k) {
    const float share = static_cast<float>(k) / static_cast<float>(above);
    lines.push_back({white + (top - white) * share, decimal(100 + 20 * k / above)});
  }
  for (int k = main; k >= 0; --k) {
    const float share = static_cast<float>(k) / static_cast<float>(main);
    lines.push_back({black + (white - black) * share, decimal(100 * k / main)});
  }
  for (int k = below - 1; k >= 0; --k) {
    const float t = static_cast<float>(k) / static_cast<float>(below);
    lines.push_back({bottom + (black - bottom) * t, decimal(static_cast<int>(20.0f * t - 20.0f))});
  }
  return lines;
}

float lumaHeight(float luma, bool extended, float height) {
  return extended ? (luma + 0.25f) / 1.5f * height : luma * height;
}

const std::array<ColourBar, 9>& colourBars() {
  constexpr float kFull = 191.0f / 255.0f;
  constexpr float kGrey = 0.40000004f;
  static const std::array<ColourBar, 9> bars = {{{{kGrey, kGrey, kGrey}},
                                                 {{kFull, kFull, kFull}},
                                                 {{kFull, kFull, 0}},
                                                 {{0, kFull, kFull}},
                                                 {{0, kFull, 0}},
                                                 {{kFull, 0, kFull}},
                                                 {{kFull, 0, 0}},
                                                 {{0, 0, kFull}},
                                                 {{kGrey, kGrey, kGrey}}}};
  return bars;
}

std::vector<ColourBarMarker> colourBarMarkers(int32_t colorSpace, bool extended, float frameWidth,
                                              float frameHeight, float textureScale, float left,
                                              float right, float height) {
  const ColourSpaceMatrices* space = colourSpaceMatrices(colorSpace);
  std::vector<ColourBarMarker> markers;
  if (space == nullptr || !(frameWidth > 0) || !(frameHeight > 0) || !(textureScale > 0)) {
    return markers;
  }
  const Vector3& weights = space->toYCbCr[0];
  const float barWidth =
      16.0f / (81.0f * textureScale) * (frameHeight / frameWidth) * (right - left);
  const float first = 0.5f * (left + right) - 4.5f * barWidth;
  for (size_t i = 0; i < colourBars().size(); ++i) {
    const float start = first + static_cast<float>(i) * barWidth;
    const float end = start + barWidth;
    if (start >= right) {
      break;
    }
    if (end <= left) {
      continue;
    }
    const auto& rgb = colourBars()[i].rgb;
    const double luma = weights[0] * rgb[0] + weights[1] * rgb[1] + weights[2] * rgb[2];
    markers.push_back({std::max(start, left), std::min(end, right),
                       lumaHeight(static_cast<float>(luma), extended, height), rgb});
  }
  return markers;
}

}  // namespace plugin::Scopes

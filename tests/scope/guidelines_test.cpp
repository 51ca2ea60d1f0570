// The IRE guideline list and the colour-bar marker places.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "scope/guidelines.h"

namespace {

using namespace plugin::Scopes;

std::vector<std::string> labels(const GuidelineList& lines) {
  std::vector<std::string> texts;
  for (const Guideline& line : lines) {
    texts.emplace_back(line.label.begin(), line.label.end());
  }
  return texts;
}

TEST(Guidelines, ExtendedRangeHasTenMainDivisionsAndTwoBeyondEachEnd) {
  const GuidelineList lines = buildGuidelines(true, 10, 600);
  const std::vector<std::string> expected = {"120", "110", "100", "90", "80", "70",  "60", "50",
                                             "40",  "30",  "20",  "10", "0",  "-10", "-20"};
  EXPECT_EQ(labels(lines), expected);
  ASSERT_EQ(lines.size(), expected.size());
  EXPECT_NEAR(lines[0].y, 580, 1e-3);   // 120 IRE
  EXPECT_NEAR(lines[1].y, 540, 1e-3);   // 110 IRE
  EXPECT_NEAR(lines[2].y, 500, 1e-3);   // 100 IRE
  EXPECT_NEAR(lines[7].y, 300, 1e-3);   // 50 IRE
  EXPECT_NEAR(lines[12].y, 100, 1e-3);  // 0 IRE
  EXPECT_NEAR(lines[13].y, 60, 1e-3);   // -10 IRE
  EXPECT_NEAR(lines[14].y, 20, 1e-3);   // -20 IRE
}

TEST(Guidelines, DivisionsShrinkWithTheRoomForLabels) {
  struct Case {
    bool extended;
    float spacing, height;
    std::vector<std::string> labels;
  };
  const Case cases[] = {
      // The unit range has nothing above 100 or below 0.
      {false, 10, 300, {"100", "90", "80", "70", "60", "50", "40", "30", "20", "10", "0"}},
      {false, 10, 180, {"100", "80", "60", "40", "20", "0"}},  // room 9: 5 divisions
      {false, 10, 80, {"100", "75", "50", "25", "0"}},         // room 4
      {false, 10, 70, {"100", "50", "0"}},                     // room 3.5: 2
      {false, 10, 39, {"100", "0"}},                           // room 1.95: 1
      // Room for one line beyond each end: 120 and -20 IRE.
      {true, 10, 180, {"120", "100", "80", "60", "40", "20", "0", "-20"}},
      {true, 10, 100, {"100", "50", "0"}},  // none beyond
  };
  for (const Case& c : cases) {
    EXPECT_EQ(labels(buildGuidelines(c.extended, c.spacing, c.height)), c.labels)
        << "extended " << c.extended << ", height " << c.height;
  }
  const GuidelineList unit = buildGuidelines(false, 10, 300);
  EXPECT_EQ(unit.front().y, 300);
  EXPECT_EQ(unit.back().y, 0);
}

TEST(ColourBarMarkers, LumaOfEachBarPerColourSpace) {
  const auto markers = colourBarMarkers(709, false, 1920, 1080, 1, 0, 900, 1);
  ASSERT_EQ(markers.size(), 9u);
  // The 75 % yellow bar.
  EXPECT_NEAR(markers[2].y, 0.69494, 1e-5);
  EXPECT_NEAR(markers[1].y, 0.7490196, 1e-6);  // white: the weights add up to one
  EXPECT_NEAR(markers[0].y, 0.4, 1e-6);
  EXPECT_NEAR(colourBarMarkers(601, false, 1920, 1080, 1, 0, 900, 1)[6].y, 0.299 * 0.7490196, 1e-6);
  EXPECT_NEAR(colourBarMarkers(2020, false, 1920, 1080, 1, 0, 900, 1)[7].y, 0.0593 * 0.7490196,
              1e-6);
  // The extended range puts 0 IRE at one sixth and 100 IRE at five sixths of the height.
  const auto extended = colourBarMarkers(709, true, 1920, 1080, 1, 0, 900, 600);
  EXPECT_NEAR(extended[2].y, (0.69494 + 0.25) / 1.5 * 600, 1e-3);
  EXPECT_TRUE(colourBarMarkers(0, false, 1920, 1080, 1, 0, 900, 1).empty());
}

TEST(ColourBarMarkers, NineBarsSpanTheWidthOfAWideFrame) {
  const auto markers = colourBarMarkers(709, false, 1280, 720, 1, 100, 1000, 300);
  ASSERT_EQ(markers.size(), 9u);
  for (size_t i = 0; i < markers.size(); ++i) {
    EXPECT_NEAR(markers[i].left, 100 + 100.0f * i, 1e-3) << i;
    EXPECT_NEAR(markers[i].right, 200 + 100.0f * i, 1e-3) << i;
    EXPECT_EQ(markers[i].rgb, colourBars()[i].rgb) << i;
  }
}

TEST(ColourBarMarkers, BarsBeyondThePanelAreCutOrLeftOut) {
  // A 4:3 frame: bars a third wider than on 16:9 (133.3 pixels), starting 150 pixels left of
  // the panel. The first ends outside and the last starts outside it; the next ones are cut.
  const auto narrow = colourBarMarkers(709, false, 640, 480, 1, 0, 900, 300);
  ASSERT_EQ(narrow.size(), 7u);
  EXPECT_EQ(narrow[0].rgb, colourBars()[1].rgb);
  EXPECT_NEAR(narrow[0].left, 0, 1e-3);
  EXPECT_NEAR(narrow[0].right, 116.667, 1e-2);
  EXPECT_NEAR(narrow[3].right - narrow[3].left, 133.333, 1e-2);
  EXPECT_EQ(narrow[6].rgb, colourBars()[7].rgb);
  EXPECT_NEAR(narrow[6].right, 900, 1e-3);
  // At a texture scale of a third the bars are three times wider: only the middle three remain.
  const auto wide = colourBarMarkers(709, false, 1280, 720, 1.0f / 3, 0, 900, 300);
  ASSERT_EQ(wide.size(), 3u);
  EXPECT_EQ(wide[0].rgb, colourBars()[3].rgb);
  EXPECT_EQ(wide[2].rgb, colourBars()[5].rgb);
  EXPECT_NEAR(wide[0].left, 0, 1e-3);
  EXPECT_NEAR(wide[2].right, 900, 1e-3);
}

}  // namespace

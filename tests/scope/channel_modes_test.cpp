// Display indexes per mode, and the colour-space conversions.
#include <gtest/gtest.h>

#include "scope/channel_modes.h"
#include "scope/colour_space.h"

namespace {

using namespace plugin::Scopes;

TEST(DisplayIndexFor, EveryModeWithAndWithoutOverlay) {
  struct Case {
    int32_t mode;
    DisplayIndex alone;
    DisplayIndex overlay;
  };
  const Case cases[] = {
      {0, kDisplayAsStored, kDisplayAverageGrey},  {1, kDisplayAsStored, kDisplayAverageGrey},
      {4, kDisplayChroma, kDisplayAverageGrey},    {5, kDisplayRedTint, kDisplayRedAsGrey},
      {6, kDisplayGreenTint, kDisplayGreenAsGrey}, {7, kDisplayBlueTint, kDisplayBlueAsGrey},
      {8, kDisplayAsStored, kDisplayAsStored},
  };
  for (const Case& c : cases) {
    EXPECT_EQ(displayIndexFor(c.mode, false), c.alone) << c.mode;
    EXPECT_EQ(displayIndexFor(c.mode, true), c.overlay) << c.mode;
  }
}

TEST(ColourSpace, LumaOfPureRedPerSpace) {
  EXPECT_DOUBLE_EQ(rgbToYCbCr(601, {1, 0, 0})[0], 0.299);
  EXPECT_DOUBLE_EQ(rgbToYCbCr(709, {1, 0, 0})[0], 0.2126);
  EXPECT_DOUBLE_EQ(rgbToYCbCr(2020, {1, 0, 0})[0], 0.2627);
}

TEST(ColourSpace, GreyHasNoColourDifferenceAndRoundTrips) {
  const Vector3 samples[] = {{1, 1, 1}, {0.5, 0.5, 0.5}, {1, 0, 0}, {0.2, 0.7, 0.4}, {0, 0, 1}};
  for (const int32_t space : {601, 709, 2020}) {
    const Vector3 white = rgbToYCbCr(space, {1, 1, 1});
    EXPECT_NEAR(white[0], 1.0, 1e-12) << space;
    EXPECT_NEAR(white[1], 0.0, 1e-12) << space;
    EXPECT_NEAR(white[2], 0.0, 1e-12) << space;
    for (const Vector3& rgb : samples) {
      const Vector3 back = yCbCrToRgb(space, rgbToYCbCr(space, rgb));
      for (size_t c = 0; c < 3; ++c) {
        EXPECT_NEAR(back[c], rgb[c], 1e-5) << space << " channel " << c;
      }
    }
  }
}

TEST(ColourSpace, OtherNumbersConvertToZero) {
  for (const int32_t space : {0, 2, 600, 2021, -709}) {
    EXPECT_EQ(rgbToYCbCr(space, {1, 0.5, 0.25}), (Vector3{0, 0, 0})) << space;
    EXPECT_EQ(yCbCrToRgb(space, {1, 0.5, 0.25}), (Vector3{0, 0, 0})) << space;
    EXPECT_EQ(colourSpaceMatrices(space), nullptr);
  }
}

}  // namespace

// The built-in test frame: its bars where the scope expects them and its ramp from black to
// white.
#include "test_frame.h"

#include <gtest/gtest.h>

#include <array>
#include <cmath>

namespace vtpl::host {
namespace {

// The pixel's channels as 8-bit codes.
std::array<long, 4> codes(const Image& frame, int x, int y) {
  const float* pixel = frame.pixel(x, y);
  return {std::lround(pixel[0] * 255), std::lround(pixel[1] * 255), std::lround(pixel[2] * 255),
          std::lround(pixel[3] * 255)};
}

TEST(TestFrame, NineBarsOfEqualWidthOverTheTopTwoThirds) {
  const int expected[9][3] = {{102, 102, 102}, {191, 191, 191}, {191, 191, 0},
                              {0, 191, 191},   {0, 191, 0},     {191, 0, 191},
                              {191, 0, 0},     {0, 0, 191},     {102, 102, 102}};
  const Image frame = colourBarTestFrame(720, 405);
  ASSERT_EQ(frame.width, 720);
  ASSERT_EQ(frame.height, 405);
  EXPECT_EQ(frame.bitDepth, 8);
  ASSERT_EQ(frame.rgba.size(), 4u * 720 * 405);
  for (int bar = 0; bar < 9; ++bar) {
    const std::array<long, 4> colour = {expected[bar][0], expected[bar][1], expected[bar][2], 255};
    // Centre, first and last column of each 80-pixel bar, at the top and the last bar row.
    for (const int x : {bar * 80 + 40, bar * 80, bar * 80 + 79}) {
      for (const int y : {0, 135, 269}) {
        EXPECT_EQ(codes(frame, x, y), colour) << "bar " << bar << " at " << x << "," << y;
      }
    }
  }
}

TEST(TestFrame, BottomThirdIsAGreyRampFromBlackToWhite) {
  const Image frame = colourBarTestFrame(720, 405);
  for (const int y : {270, 337, 404}) {
    EXPECT_EQ(codes(frame, 0, y), (std::array<long, 4>{0, 0, 0, 255}));
    EXPECT_EQ(codes(frame, 719, y), (std::array<long, 4>{255, 255, 255, 255}));
    long previous = -1;
    for (int x = 0; x < 720; ++x) {
      const std::array<long, 4> pixel = codes(frame, x, y);
      ASSERT_EQ(pixel[0], pixel[1]) << x;
      ASSERT_EQ(pixel[0], pixel[2]) << x;
      ASSERT_GE(pixel[0], previous) << x;
      ASSERT_EQ(frame.pixel(x, y)[0] * 255, static_cast<float>(pixel[0])) << "whole codes";
      previous = pixel[0];
    }
  }
  EXPECT_EQ(codes(frame, 360, 300)[0], 128);
}

TEST(TestFrame, BarsSpanAnyWidthInNineParts) {
  const Image frame = colourBarTestFrame(1920, 1080);
  EXPECT_EQ(codes(frame, 0, 0)[0], 102);
  EXPECT_EQ(codes(frame, 1919, 719)[0], 102);
  EXPECT_EQ(codes(frame, 1919, 720)[0], 255);
  EXPECT_EQ(codes(frame, 1920 / 2, 100), (std::array<long, 4>{0, 191, 0, 255}));
  // Bar 1 (white) starts at 1920 / 9 = 213.3: column 214.
  EXPECT_EQ(codes(frame, 213, 0)[0], 102);
  EXPECT_EQ(codes(frame, 214, 0)[0], 191);
}

}  // namespace
}  // namespace vtpl::host

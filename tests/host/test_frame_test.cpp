// The built-in test frame: its bars where the scope expects them and its ramp from black to
// white.
#include "test_frame.h"

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <tuple>

namespace vtpl::host {
namespace {

// The pixel's channels as 8-bit codes.
std::array<long, 4> codes(const Image& frame, int x, int y) {
  const float* pixel = frame.pixel(x, y);
  return {std::lround(pixel[0] * 255), std::lround(pixel[1] * 255), std::lround(pixel[2] * 255),
          std::lround(pixel[3] * 255)};
}

TEST(TestFrame, NineBarsOfEqualWidthOverTheTopTwoThirds) {
  const std::array<long, 4> bars[9] = {
      {102, 102, 102, 255}, {191, 191, 191, 255}, {191, 191, 0, 255},
      {0, 191, 191, 255},   {0, 191, 0, 255},     {191, 0, 191, 255},
      {191, 0, 0, 255},     {0, 0, 191, 255},     {102, 102, 102, 255}};
  const Image frame = colourBarTestFrame(720, 405);
  ASSERT_EQ(std::tie(frame.width, frame.height, frame.bitDepth), std::tuple(720, 405, 8));
  ASSERT_EQ(frame.rgba.size(), 4u * 720 * 405);
  for (int bar = 0; bar < 9; ++bar) {
    // Centre, first and last column of each 80-pixel bar, at the top and the last bar row.
    for (const int x : {bar * 80 + 40, bar * 80, bar * 80 + 79}) {
      for (const int y : {0, 135, 269}) {
        EXPECT_EQ(codes(frame, x, y), bars[bar]) << "bar " << bar << " at " << x << "," << y;
      }
    }
  }
  // Any width is split in nine: at 1920, bar 1 (white) starts at 213.3, that is column 214.
  const Image wide = colourBarTestFrame(1920, 1080);
  EXPECT_EQ(codes(wide, 213, 0), bars[0]);
  EXPECT_EQ(codes(wide, 214, 0), bars[1]);
  EXPECT_EQ(codes(wide, 960, 100), bars[4]);
  EXPECT_EQ(codes(wide, 1919, 719), bars[8]);
  EXPECT_EQ(codes(wide, 1919, 720)[0], 255);  // the ramp starts at two thirds
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

}  // namespace
}  // namespace vtpl::host

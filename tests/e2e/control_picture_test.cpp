// The scope control as the host shows it: drawn on the interface thread into a picture of the
// control's size, which the host reads back.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <utility>

#include "image.h"
#include "test_frame.h"
#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::host::ControlOptions;
using vtpl::host::Image;

std::unique_ptr<vtpl::host::EffectHost> openGlHost() {
  vtpl::host::HostSettings settings = declaredStateSettings();
  settings.gl = true;
  return openHost(settings);
}

ControlOptions sized(int32_t width, int32_t height) {
  ControlOptions options;
  options.width = width;
  options.height = height;
  return options;
}

TEST(ControlPicture, HasTheControlsSize) {
  auto host = openGlHost();
  EXPECT_EQ(host->controlPicture().rgba.size(), 0u);
  host->attachControl();
  host->renderFrame(vtpl::host::colourBarTestFrame(36, 24));
  for (const auto& [width, height] : {std::pair{40, 24}, std::pair{17, 61}, std::pair{1, 1}}) {
    ASSERT_EQ(host->drawControl(sized(width, height)), 1);
    const Image& picture = host->controlPicture();
    EXPECT_EQ(picture.width, width);
    EXPECT_EQ(picture.height, height);
    EXPECT_EQ(picture.bitDepth, 8);
    EXPECT_EQ(picture.rgba.size(), 4u * width * height);
  }
  host->detachControl();
}

TEST(ControlPicture, HoldsOnlyWholeEightBitCodesInRange) {
  auto host = openGlHost();
  host->attachControl();
  host->renderFrame(vtpl::host::colourBarTestFrame(36, 24));
  ASSERT_EQ(host->drawControl(sized(30, 20)), 1);
  const Image& picture = host->controlPicture();
  ASSERT_EQ(picture.rgba.size(), 4u * 30 * 20);
  for (size_t i = 0; i < picture.rgba.size(); i += 4) {
    const float alpha = picture.rgba[i + 3];
    ASSERT_EQ(alpha * 255.0f, static_cast<float>(static_cast<int>(alpha * 255.0f + 0.5f))) << i;
    for (int c = 0; c < 3; ++c) {
      ASSERT_GE(picture.rgba[i + c], 0.0f) << i;
      ASSERT_LE(picture.rgba[i + c], 1.0f) << i;
    }
  }
}

// A drawing of no size has no picture to read back; the message is still sent.
TEST(ControlPicture, DrawingOfNoSizeLeavesNoPicture) {
  std::ostringstream trace;
  vtpl::host::HostSettings settings = declaredStateSettings();
  settings.gl = true;
  auto host = openHost(settings, &trace);
  ASSERT_EQ(host->drawControl(sized(20, 10)), 1);
  ASSERT_EQ(host->controlPicture().width, 20);
  trace.str("");
  EXPECT_EQ(host->drawControl(sized(0, 10)), 1);
  EXPECT_EQ(host->controlPicture().width, 0);
  EXPECT_EQ(host->controlPicture().rgba.size(), 0u);
  EXPECT_NE(trace.str().find("< Notify 1003 -> 1"), std::string::npos) << trace.str();
}

}  // namespace
}  // namespace waveform_test

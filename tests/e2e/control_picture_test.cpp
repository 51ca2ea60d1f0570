// The scope control as the host shows it: drawn on the interface thread into a picture of the
// control's size, which the host reads back.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <utility>
#include <vector>

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

Image greyFrame(float level, int width = 32, int height = 18) {
  Image picture;
  picture.width = width;
  picture.height = height;
  picture.rgba.assign(4u * width * height, level);
  for (size_t i = 3; i < picture.rgba.size(); i += 4) {
    picture.rgba[i] = 1.0f;
  }
  return picture;
}

// The control without graticule: only the traces over the black panel. Attached, the render
// analyses the frame; otherwise the control analyses it on the interface thread before drawing.
std::unique_ptr<vtpl::host::EffectHost> openTracesOnlyHost(bool attached = true) {
  auto host = openGlHost();
  host->parameters().writeBool("showGuidelines", false);
  host->parameters().writeBool("showStandardColorBars", false);
  if (attached) {
    host->attachControl();
  }
  return host;
}

// The rows (top first) of a picture column whose `channel` is lit.
std::vector<int> litRows(const Image& picture, int x, int channel) {
  std::vector<int> rows;
  for (int y = 0; y < picture.height; ++y) {
    if (picture.pixel(x, y)[channel] > 0.2f) {
      rows.push_back(y);
    }
  }
  return rows;
}

// 60 x 50 with margins of 10: the waveform panel is rows 10 to 39 from the top, and a level v
// lands v x 30 pixels above its bottom.
constexpr int kControlWidth = 60;
constexpr int kControlHeight = 50;

TEST(ControlPicture, GreyFrameTraceSitsAtItsLevelInsideTheBlackPanel) {
  for (const bool attached : {true, false}) {
    auto host = openTracesOnlyHost(attached);
    host->renderFrame(greyFrame(0.5f));
    ASSERT_EQ(host->drawControl(sized(kControlWidth, kControlHeight)), 1);
    EXPECT_EQ(host->callbackCount("fetchOwnLayer"), attached ? 0 : 1);
    const Image& picture = host->controlPicture();
    const float background = 38.0f / 255.0f;  // the host's panel colour, 0.15
    for (const int x : {0, 30, 59}) {
      const std::string where =
          "attached " + std::to_string(attached) + " column " + std::to_string(x);
      EXPECT_EQ(litRows(picture, x, 0), std::vector<int>{24}) << where;
      EXPECT_NEAR(picture.pixel(x, 5)[0], background, 1e-6) << where << " top margin";
      EXPECT_NEAR(picture.pixel(x, 45)[2], background, 1e-6) << where << " bottom margin";
      EXPECT_EQ(picture.pixel(x, 12)[1], 0.0f) << where << " black panel";
      EXPECT_EQ(picture.pixel(x, 37)[1], 0.0f) << where << " black panel";
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

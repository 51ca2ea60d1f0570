// Frames rendered and the scope control drawn through the module on the host's GL threads: the
// layer reaches the output unchanged, the host serves the own layer to the effect, and the
// control's picture, drawn on the interface thread, is read back at the control's size.
#include <gtest/gtest.h>

#include <cmath>
#include <random>
#include <sstream>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "gl_thread.h"
#include "image.h"
#include "layer_textures.h"
#include "test_frame.h"
#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::host::ControlOptions;
using vtpl::host::Image;

// An opaque picture of random 8-bit levels (or any level in 0..1 for 16-bit pictures).
Image randomPicture(int width, int height, int bitDepth, unsigned seed) {
  std::mt19937 random(seed);
  Image picture;
  picture.width = width;
  picture.height = height;
  picture.bitDepth = bitDepth;
  picture.rgba.resize(4 * static_cast<size_t>(width) * height);
  const unsigned levels = bitDepth == 16 ? 65535 : 255;
  for (size_t i = 0; i < picture.rgba.size(); ++i) {
    picture.rgba[i] = i % 4 == 3 ? 1.0f : static_cast<float>(random() % (levels + 1)) / levels;
  }
  return picture;
}

// The same code at the picture's bit depth everywhere; from float storage the very same value.
void expectSamePicture(const Image& output, const Image& input, bool floatStorage) {
  ASSERT_EQ(output.width, input.width);
  ASSERT_EQ(output.height, input.height);
  const float levels = input.bitDepth == 16 ? 65535.0f : 255.0f;
  for (size_t i = 0; i < input.rgba.size(); ++i) {
    const std::string where = "pixel " + std::to_string((i / 4) % input.width) + "," +
                              std::to_string((i / 4) / input.width) + " channel " +
                              std::to_string(i % 4);
    ASSERT_EQ(std::lround(output.rgba[i] * levels), std::lround(input.rgba[i] * levels)) << where;
    if (floatStorage) {
      ASSERT_EQ(output.rgba[i], input.rgba[i]) << where;
    }
  }
}

// The layer reaches the output bit for bit from exact and padded storage, 8-bit, 16-bit and 8-bit
// uploaded as float, at odd and even sizes of 720 rows, also when the host stops the render, and
// through a scope blended over the whole frame that has nothing to draw (an empty analysed
// rectangle, no graticule, a transparent background).
TEST(Render, LayerReachesTheOutputUnchanged) {
  struct Case {
    int width, height, bitDepth;
    bool asFloat;
    bool pad;
    int stopAt;
    int32_t blend;
  };
  const Case cases[] = {
      {19, 11, 8, false, false, -1, 0},     {19, 11, 8, false, true, -1, 0},
      {19, 11, 16, false, true, -1, 0},     {1280, 720, 16, false, false, -1, 0},
      {1281, 721, 16, false, true, -1, 0},  {1280, 720, 8, true, false, -1, 0},
      {1281, 721, 8, false, false, -1, 0},
      {19, 11, 8, false, false, 0, 0},      {19, 11, 8, false, false, 90, 0},
      {1280, 720, 16, false, false, -1, 1},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(testing::Message() << c.width << "x" << c.height << " bit depth " << c.bitDepth
                                    << " float " << c.asFloat << " pad " << c.pad << " stop at "
                                    << c.stopAt << " blend " << c.blend);
    const Image input = randomPicture(c.width, c.height, c.bitDepth, 5);
    auto host = openHost(glSettings(c.pad));
    host->faults().stopAtProgress = c.stopAt;
    host->setValueFromText("blendType", std::to_string(c.blend));
    host->setValueFromText("clipEndPos", "-640,-360");
    expectSamePicture(host->renderFrame(input, c.asFloat), input, c.asFloat || c.bitDepth == 16);
  }
}

TEST(Render, OwnLayerIsFetchedForTheRenderedFrameOnly) {
  auto host = openHost(glSettings(true));
  const Image input = randomPicture(10, 6, 8, 13);
  host->renderFrame(input);
  const vtpl::HostEffectRecord& record = host->record();
  vtpl::HostTexture own{};
  vtpl::HostTexture missing{};
  missing.name = 99;
  Image fetched;
  vtpl::host::GlThread other("interface");
  other.run([&] {
    record.fetchOwnLayer(host.get(), 0, 0, &own);
    record.fetchOwnLayer(host.get(), 0, 1, &missing);
    fetched = vtpl::host::readLayer(own, 8);
    record.releaseLayer(host.get(), nullptr, own.name);
  });
  // A texture in padded storage for frame 0, none for frame 1.
  EXPECT_EQ(std::tuple(own.name != 0, own.allocatedWidth, own.uMax, missing.name),
            std::tuple(true, 16u, 10.0f / 16.0f, 0u));
  expectSamePicture(fetched, input, false);
}

ControlOptions sized(int32_t width, int32_t height) {
  ControlOptions options;
  options.width = width;
  options.height = height;
  return options;
}

// A drawing of no size is still sent to the effect but has no picture to read back.
TEST(ControlPicture, HasTheControlsSize) {
  std::ostringstream trace;
  auto host = openHost(glSettings(), &trace);
  EXPECT_EQ(host->controlPicture().rgba.size(), 0u);
  host->attachControl();
  host->renderFrame(vtpl::host::colourBarTestFrame(36, 24));
  for (const auto& [width, height] :
       {std::pair{40, 24}, std::pair{17, 61}, std::pair{1, 1}, std::pair{0, 10}}) {
    trace.str("");
    ASSERT_EQ(host->drawControl(sized(width, height)), 1);
    EXPECT_NE(trace.str().find("< Notify 1003 -> 1"), std::string::npos) << trace.str();
    const Image& picture = host->controlPicture();
    const int shownHeight = width == 0 ? 0 : height;
    EXPECT_EQ(std::tie(picture.width, picture.height, picture.bitDepth),
              std::tuple(width, shownHeight, 8));
    EXPECT_EQ(picture.rgba.size(), 4u * width * shownHeight);
  }
  host->detachControl();
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

// The control without graticule: only the trace of a grey frame, over the black waveform panel
// inside the host's panel colour. Attached, the render analyses the frame; otherwise the control
// analyses it on the interface thread before drawing. At 60 x 50 the margins are 10 pixels: the
// waveform panel is rows 10 to 39 from the top, and a level v lands v x 30 pixels above its bottom.
TEST(ControlPicture, GreyFrameTraceSitsAtItsLevelInsideTheBlackPanel) {
  for (const bool attached : {true, false}) {
    auto host = openHost(glSettings());
    host->parameters().writeBool("showGuidelines", false);
    host->parameters().writeBool("showStandardColorBars", false);
    if (attached) {
      host->attachControl();
    }
    host->renderFrame(greyPicture(32, 18));
    ASSERT_EQ(host->drawControl(sized(60, 50)), 1);
    EXPECT_EQ(host->callbackCount("fetchOwnLayer"), attached ? 0 : 1);
    const Image& picture = host->controlPicture();
    for (const int x : {0, 30, 59}) {
      const std::string where =
          "attached " + std::to_string(attached) + " column " + std::to_string(x);
      EXPECT_EQ(litRows(picture, x, 0), std::vector<int>{24}) << where;
      EXPECT_NEAR(picture.pixel(x, 5)[0], 38.0f / 255.0f, 1e-6) << where << " panel colour 0.15";
      EXPECT_EQ(picture.pixel(x, 12)[1], 0.0f) << where << " black waveform panel";
    }
  }
}

// An 8-bit layer and a float layer of the same grey read the same level under the one graticule,
// side by side and overlaid (the effect's layer in red, the comparison in green), whether the
// render or the control analyses them and whichever of the two is the float one.
TEST(ControlPicture, LayersOfEitherBitDepthShowALevelAtTheSameHeight) {
  for (const bool attached : {true, false}) {
    for (const bool floatComparison : {true, false}) {
      for (const int32_t type : {0, 1}) {
        SCOPED_TRACE(testing::Message() << "attached " << attached << " float comparison "
                                        << floatComparison << " type " << type);
        auto host = openHost(glSettings());
        host->parameters().writeBool("showGuidelines", false);
        host->parameters().writeBool("showStandardColorBars", false);
        host->parameters().writeInt("scopeComparisonType", type);
        host->setComparisonLayer(greyPicture(32, 18, 0.9f), floatComparison);
        if (attached) {
          host->attachControl();
        }
        host->renderFrame(greyPicture(32, 18, 0.9f), !floatComparison);
        ASSERT_EQ(host->drawControl(sized(60, 50)), 1);
        const Image& picture = host->controlPicture();
        const std::vector<int> ownRows = litRows(picture, 15, 0);
        EXPECT_EQ(ownRows.size(), 1u);
        EXPECT_EQ(type == 0 ? litRows(picture, 45, 0) : litRows(picture, 15, 1), ownRows);
      }
    }
  }
}

// A control that analyses a frame whose own layer the host cannot hand out shows no waveform
// for it rather than the previous frame's as if it were this one's.
TEST(ControlPicture, FrameWithoutOwnLayerShowsNoWaveform) {
  auto host = openHost(glSettings());
  host->parameters().writeBool("showGuidelines", false);
  host->parameters().writeBool("showStandardColorBars", false);
  host->attachControl();
  host->renderFrame(greyPicture(32, 18));
  // The host holds a layer for frame 0 only.
  for (const int frame : {0, 1}) {
    ASSERT_EQ(host->drawControl({frame, 2, true, false, 60, 50}), 1);
    EXPECT_EQ(litRows(host->controlPicture(), 30, 0).size(), frame == 0 ? 1u : 0u)
        << "frame " << frame;
  }
  EXPECT_EQ(host->callbackCount("fetchOwnLayer"), 1);
}

}  // namespace
}  // namespace waveform_test

// Frames rendered through the module on the host's GL threads: the layer reaches the output
// unchanged, from exact and padded textures, 8-bit and float, even when the host asks to stop.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>

#include "gl_thread.h"
#include "image.h"
#include "layer_textures.h"
#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::host::Image;

// An opaque picture of random 8-bit levels (or any level in 0..1 for 16-bit pictures).
Image randomPicture(int width, int height, int bitDepth, unsigned seed) {
  std::mt19937 random(seed);
  Image picture;
  picture.width = width;
  picture.height = height;
  picture.bitDepth = bitDepth;
  picture.rgba.resize(4 * static_cast<size_t>(width) * height);
  for (size_t i = 0; i < picture.rgba.size(); ++i) {
    const bool alpha = i % 4 == 3;
    picture.rgba[i] = alpha ? 1.0f
                            : (bitDepth == 16 ? static_cast<float>(random() % 65536) / 65535.0f
                                              : static_cast<float>(random() % 256) / 255.0f);
  }
  return picture;
}

vtpl::host::HostSettings glSettings(bool pad) {
  vtpl::host::HostSettings settings = declaredStateSettings();
  settings.gl = true;
  settings.padTextures = pad;
  return settings;
}

// Every value within `tolerance`, and the same code at the picture's bit depth.
void expectSamePicture(const Image& output, const Image& input, float tolerance) {
  ASSERT_EQ(output.width, input.width);
  ASSERT_EQ(output.height, input.height);
  const float levels = input.bitDepth == 16 ? 65535.0f : 255.0f;
  float largest = 0.0f;
  for (size_t i = 0; i < input.rgba.size(); ++i) {
    const std::string where = "pixel " + std::to_string((i / 4) % input.width) + "," +
                              std::to_string((i / 4) / input.width) + " channel " +
                              std::to_string(i % 4);
    ASSERT_EQ(std::lround(output.rgba[i] * levels), std::lround(input.rgba[i] * levels)) << where;
    ASSERT_NEAR(output.rgba[i], input.rgba[i], tolerance) << where;
    largest = std::fmax(largest, std::fabs(output.rgba[i] - input.rgba[i]));
  }
  char text[32];
  std::snprintf(text, sizeof text, "%.3g", largest);
  testing::Test::RecordProperty("largestDifference", text);
}

TEST(Render, EightBitLayerReachesTheOutputExactly) {
  const Image input = randomPicture(23, 13, 8, 3);
  for (const bool pad : {false, true}) {
    auto host = openHost(glSettings(pad));
    const Image output = host->renderFrame(input);
    expectSamePicture(output, input, 1e-6f);
  }
}

// Linear filtering at texel centres on the software renderer drifts by up to about 2.2e-6 (seen
// here, from padded storage); well inside half a 16-bit step, which the code comparison checks.
TEST(Render, FloatLayerReachesTheOutputWithinRounding) {
  const Image input = randomPicture(19, 11, 16, 5);
  for (const bool pad : {false, true}) {
    auto host = openHost(glSettings(pad));
    expectSamePicture(host->renderFrame(input), input, 4e-6f);
  }
  auto host = openHost(glSettings(false));
  expectSamePicture(host->renderFrame(randomPicture(8, 8, 8, 9), true), randomPicture(8, 8, 8, 9),
                    1e-6f);
}

TEST(Render, StoppedRenderStillCopiesTheLayer) {
  const Image input = randomPicture(12, 7, 8, 7);
  for (const int stopAt : {0, 90}) {
    auto host = openHost(glSettings(false));
    host->faults().stopAtProgress = stopAt;
    expectSamePicture(host->renderFrame(input), input, 1e-6f);
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
  EXPECT_NE(own.name, 0u);
  EXPECT_EQ(own.allocatedWidth, 16u);  // padded storage
  EXPECT_EQ(own.uMax, 10.0f / 16.0f);
  EXPECT_EQ(missing.name, 0u);
  expectSamePicture(fetched, input, 1e-6f);
}

TEST(Render, ToolRendersAPictureFile) {
  const Image input = randomPicture(31, 17, 8, 11);
  const std::string folder = testing::TempDir();
  const std::string in = folder + "/render_in.png";
  const std::string out = folder + "/render_out.png";
  vtpl::host::writePng(in, input);
  const std::string command =
      std::string(VTPL_HOST_TOOL_PATH) + " render '" + in + "' -o '" + out + "' --pad";
  ASSERT_EQ(std::system(command.c_str()), 0) << command;
  expectSamePicture(vtpl::host::readPng(out), input, 1e-6f);
  std::remove(in.c_str());
  std::remove(out.c_str());
}

}  // namespace
}  // namespace waveform_test

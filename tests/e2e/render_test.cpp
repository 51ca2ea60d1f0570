// Frames rendered through the module on the host's GL threads: the layer reaches the output
// unchanged, and the layers the host serves to the effect while rendering.
#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <random>
#include <string>
#include <vector>

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

// The layer reaches the output from exact and padded storage, 8-bit, 16-bit and 8-bit uploaded as
// float, also when the host stops the render. Linear filtering at texel centres on the software
// renderer drifts by up to about 2.2e-6 (seen here, from float storage); well inside half
// a 16-bit step, which the code comparison checks.
TEST(Render, LayerReachesTheOutputUnchanged) {
  struct Case {
    int bitDepth;
    bool asFloat;
    bool pad;
    int stopAt;
    float tolerance;
  };
  const Case cases[] = {
      {8, false, false, -1, 1e-6f}, {8, false, true, -1, 1e-6f}, {16, false, false, -1, 4e-6f},
      {16, false, true, -1, 4e-6f}, {8, true, false, -1, 4e-6f}, {8, false, false, 0, 1e-6f},
      {8, false, false, 90, 1e-6f},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(testing::Message() << "bit depth " << c.bitDepth << " float " << c.asFloat
                                    << " pad " << c.pad << " stop at " << c.stopAt);
    const Image input = randomPicture(19, 11, c.bitDepth, 5);
    auto host = openHost(glSettings(c.pad));
    host->faults().stopAtProgress = c.stopAt;
    expectSamePicture(host->renderFrame(input, c.asFloat), input, c.tolerance);
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

// The comparison layer's information record as the effect reads it: kind at byte 0, frame
// count at byte 4, height at byte 112; tests may change the layer after choosing it.
TEST(Render, ComparisonLayerInformationIsWhatTheHostHolds) {
  auto host = openHost();
  vtpl::host::HostLayer* layer = host->setComparisonLayer(randomPicture(9, 5, 8, 17));
  ASSERT_NE(layer, nullptr);
  const vtpl::HostEffectRecord& record = host->record();
  char identifier[vtpl::kIdentifierChars] = {};
  void* handle = record.getLayer(host.get(), "overlayLayer", 0, 0, identifier);
  ASSERT_EQ(handle, layer);
  EXPECT_EQ(std::string(identifier, sizeof identifier), layer->identifier);

  const auto readInfo = [&](int32_t expectedStatus) {
    unsigned char bytes[sizeof(vtpl::HostLayerInfo)] = {};
    EXPECT_EQ(
        record.getLayerInfo(host.get(), handle, 0, reinterpret_cast<vtpl::HostLayerInfo*>(bytes)),
        expectedStatus);
    int32_t fields[3] = {};
    std::memcpy(&fields[0], bytes + 0, 4);
    std::memcpy(&fields[1], bytes + 4, 4);
    std::memcpy(&fields[2], bytes + 112, 4);
    return std::vector<int32_t>(fields, fields + 3);
  };
  EXPECT_EQ(readInfo(0), (std::vector<int32_t>{0, 1, 5}));
  layer->info.kind = 3;
  layer->info.frameCount = 12;
  EXPECT_EQ(readInfo(0), (std::vector<int32_t>{3, 12, 5}));

  EXPECT_EQ(host->setComparisonLayer(Image{}), nullptr);
  EXPECT_EQ(record.getLayer(host.get(), "overlayLayer", 0, 0, identifier), nullptr);
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

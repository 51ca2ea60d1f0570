// The settings the passes work from, read from the host: every field from its own parameter, at
// the time the scope reads it.
#include "plugin/scope_settings_reader.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "plugin/parameter_ids.h"

namespace {

using namespace plugin::Scopes;
namespace Id = plugin::Scopes::ParamId;
using vtpl::HostContext;

// Every number a parameter answers is its position in this list plus 1000 x the time it was read
// at, so that a field read from another parameter or at another time shows. Bools are true only
// for the one id a test names.
const std::vector<std::string> kIds = {Id::kWaveformMode,
                                       Id::kWaveformDirection,
                                       Id::kAnalysisDownsample,
                                       Id::kColorSpace,
                                       Id::kWaveformBrightness,
                                       Id::kClipStartPos,
                                       Id::kClipEndPos,
                                       Id::kScopeComparisonType,
                                       Id::kOverlayChannels,
                                       Id::kBlendType,
                                       Id::kScopePositionTL,
                                       Id::kScopePositionBR,
                                       Id::kRenderToLayerLabelScale,
                                       Id::kRenderToLayerBackgroundColor,
                                       Id::kRenderToLayerBackgroundAlpha};
std::string trueId;

float answer(const char* id, int32_t time) {
  for (size_t i = 0; i < kIds.size(); ++i) {
    if (kIds[i] == id) {
      return static_cast<float>(i) + 1000.0f * static_cast<float>(time);
    }
  }
  return -1.0f;
}
float getFloat(HostContext, const char* id, int32_t time) {
  return answer(id, time);
}
int32_t getInt(HostContext, const char* id, int32_t time) {
  return static_cast<int32_t>(answer(id, time));
}
uint8_t getBool(HostContext, const char* id, int32_t) {
  return trueId == id ? 1 : 0;
}
void getPoint(HostContext, const char* id, int32_t time, float* x, float* y) {
  *x = answer(id, time);
  *y = -answer(id, time);
}
void getColor(HostContext, const char* id, int32_t time, float* red, float* green, float* blue) {
  *red = answer(id, time);
  *green = *red + 0.25f;
  *blue = *red + 0.5f;
}

class ScopeSettingsReader : public testing::Test {
 protected:
  ScopeSettingsReader() {
    record_.getFloat = getFloat;
    record_.getAngle = getFloat;
    record_.getInt = getInt;
    record_.getBool = getBool;
    record_.getPoint = getPoint;
    record_.getColor = getColor;
  }
  Plugin::host::HostCalls host() { return {nullptr, record_}; }
  static float at(const char* id, int32_t time) { return answer(id, time); }

 private:
  vtpl::HostEffectRecord record_{};
};

TEST_F(ScopeSettingsReader, NumbersComeFromTheirOwnParameterAtTheirTime) {
  const AnalysisSettings analysis = readAnalysisSettings(host(), 7);
  EXPECT_EQ(analysis.mode, at(Id::kWaveformMode, 7));
  EXPECT_EQ(analysis.directionDegrees, at(Id::kWaveformDirection, 7));
  EXPECT_EQ(analysis.downsample, at(Id::kAnalysisDownsample, 7));
  EXPECT_EQ(analysis.colorSpace, at(Id::kColorSpace, 7));
  EXPECT_EQ(analysis.brightness, at(Id::kWaveformBrightness, 7));
  EXPECT_EQ(analysis.clipStart, (FramePoint{at(Id::kClipStartPos, 7), -at(Id::kClipStartPos, 7)}));
  EXPECT_EQ(analysis.clipEnd, (FramePoint{at(Id::kClipEndPos, 7), -at(Id::kClipEndPos, 7)}));

  // The picture's layout and the comparison type are read at time 0 whatever the frame.
  const CompositionSettings composition = readCompositionSettings(host());
  EXPECT_EQ(composition.mode, at(Id::kWaveformMode, 0));
  EXPECT_EQ(composition.comparison.type, at(Id::kScopeComparisonType, 0));
  EXPECT_EQ(composition.overlayChannels, at(Id::kOverlayChannels, 0));
  EXPECT_EQ(composition.colorSpace, at(Id::kColorSpace, 0));
  EXPECT_EQ(readComparisonSettings(host(), 7).type, at(Id::kScopeComparisonType, 0));

  const RenderToLayerSettings layer = readRenderToLayerSettings(host(), 7);
  EXPECT_EQ(layer.blend, at(Id::kBlendType, 7));
  EXPECT_EQ(readBlendType(host(), 7), at(Id::kBlendType, 7));
  EXPECT_EQ(layer.topLeft[0], at(Id::kScopePositionTL, 7));
  EXPECT_EQ(layer.bottomRight[1], -at(Id::kScopePositionBR, 7));
  EXPECT_EQ(layer.labelScale, at(Id::kRenderToLayerLabelScale, 7));
  const float red = at(Id::kRenderToLayerBackgroundColor, 7);
  EXPECT_EQ(layer.backgroundColour, (std::array<float, 3>{red, red + 0.25f, red + 0.5f}));
  EXPECT_EQ(layer.backgroundAlpha, at(Id::kRenderToLayerBackgroundAlpha, 7));
}

TEST_F(ScopeSettingsReader, EachFlagComesFromItsOwnParameter) {
  struct Case {
    const char* id;
    bool showComparison, layerGuidelines, layerLabels, layerColourBars;
  };
  const Case cases[] = {
      {Id::kShowComparison, true, false, false, false},
      {Id::kRenderToLayerShowGuidelines, false, true, false, false},
      {Id::kRenderToLayerShowsAxisLabel, false, false, true, false},
      {Id::kRenderToLayerShowStandardColorBars, false, false, false, true},
  };
  for (const Case& c : cases) {
    trueId = c.id;
    const RenderToLayerSettings layer = readRenderToLayerSettings(host(), 7);
    EXPECT_EQ(readComparisonSettings(host(), 7).showComparison, c.showComparison) << c.id;
    EXPECT_EQ(readCompositionSettings(host()).comparison.showComparison, c.showComparison) << c.id;
    EXPECT_EQ(layer.showGuidelines, c.layerGuidelines) << c.id;
    EXPECT_EQ(layer.showAxisLabels, c.layerLabels) << c.id;
    EXPECT_EQ(layer.showColourBars, c.layerColourBars) << c.id;
  }
  trueId.clear();
}

}  // namespace

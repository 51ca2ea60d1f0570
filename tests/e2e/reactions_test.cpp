// How the module shows and hides parameters and keeps the colour space in step with the layer.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::host::EffectHost;

bool visible(EffectHost& host, const char* id) {
  return host.parameters().find(id)->visible;
}

int32_t intValue(EffectHost& host, const char* id) {
  int32_t value = 0;
  host.parameters().readInt(id, value);
  return value;
}

// Sets a choice by its value and reports the change, as the editor does after a user's pick.
void change(EffectHost& host, const char* id, int32_t value) {
  ASSERT_TRUE(host.parameters().writeInt(id, value)) << id << "=" << value;
  ASSERT_EQ(host.changeParameter(id), 1);
}

const char* const kRenderToLayerIds[] = {
    "scopePositionTL",
    "scopePositionBR",
    "renderToLayerShowGuidelines",
    "renderToLayerShowsAxisLabel",
    "renderToLayerShowStandardColorBars",
    "renderToLayerLabelScale",
    "renderToLayerBackgroundColor",
    "renderToLayerBackgroundAlpha",
};

TEST(Reactions, RenderModeShowsTheOptionsOfEachMode) {
  struct Case {
    int32_t type;
    bool showComparison;
    bool overlayChannels;
  };
  const Case cases[] = {{1, false, true}, {2, true, false}, {0, false, false}, {1, false, true}};
  auto host = openHost();
  for (const Case& c : cases) {
    // Start from the opposite so that both calls must happen.
    host->parameters().setVisible("showComparison", !c.showComparison);
    host->parameters().setVisible("overlayChannels", !c.overlayChannels);
    change(*host, "scopeComparisonType", c.type);
    EXPECT_EQ(visible(*host, "showComparison"), c.showComparison) << c.type;
    EXPECT_EQ(visible(*host, "overlayChannels"), c.overlayChannels) << c.type;
  }
}

TEST(Reactions, RenderModeSetsComparisonLayerBeforeOutputChannels) {
  std::ostringstream trace;
  auto host = openHost(declaredStateSettings(), &trace);
  trace.str("");
  change(*host, "scopeComparisonType", 1);
  const std::string log = trace.str();
  const size_t first = log.find("setParamVisible(\"showComparison\", 0)");
  const size_t second = log.find("setParamVisible(\"overlayChannels\", 1)");
  ASSERT_NE(first, std::string::npos) << log;
  ASSERT_NE(second, std::string::npos) << log;
  EXPECT_LT(first, second);
}

TEST(Reactions, ColorSpaceIsShownForLuminanceAndCbCrOnly) {
  const std::pair<int32_t, bool> cases[] = {{5, false}, {0, true},  {1, false}, {4, true},
                                            {6, false}, {7, false}, {8, false}};
  auto host = openHost();
  for (const auto& [mode, shown] : cases) {
    change(*host, "waveformMode", mode);
    EXPECT_EQ(visible(*host, "colorSpace"), shown) << "mode " << mode;
  }
}

TEST(Reactions, BlendShowsTheRenderToLayerOptionsForEveryModeButNone) {
  auto host = openHost();
  const std::vector<vtpl::host::ChoiceEntry> blends =
      host->parameters().find("blendType")->declaration.choices;
  ASSERT_EQ(blends.size(), 15u);
  for (const int32_t value : {1, 0, 13, 0, 2, 11, 0}) {
    change(*host, "blendType", value);
    for (const char* id : kRenderToLayerIds) {
      EXPECT_EQ(visible(*host, id), value != 0) << id << " with blend " << value;
    }
    // The parameters outside the group are left alone.
    EXPECT_TRUE(visible(*host, "showGuidelines"));
    EXPECT_TRUE(visible(*host, "blendType"));
  }
}

TEST(Reactions, ColorSpaceFollowsTheLayerHeight) {
  const std::pair<int32_t, int32_t> cases[] = {
      {720, 709}, {576, 601}, {1081, 2020}, {1080, 709},
      {577, 709}, {480, 601}, {2160, 2020}, {0, 601},
  };
  auto host = openHost();
  for (const auto& [height, space] : cases) {
    // Start from a value the rule must overwrite.
    host->parameters().writeInt("colorSpace", space == 601 ? 2020 : 601);
    EXPECT_EQ(host->changeParentLayer(1920, height), 1);
    EXPECT_EQ(intValue(*host, "colorSpace"), space) << "height " << height;
  }
}

TEST(Reactions, ColorSpacePickedByHandStaysAcrossLayerChanges) {
  for (const int32_t message : {13, 14}) {
    auto host = openHost();
    host->parameters().writeInt("colorSpace", 601);
    ASSERT_EQ(host->changeParameter("colorSpace"), 1);
    ASSERT_EQ(host->editParameter("colorSpace", message), 1);
    int32_t followsLayer = -1;
    host->parameters().readInt("defaultColorSpace", followsLayer);
    EXPECT_EQ(followsLayer, 0) << "message " << message;

    EXPECT_EQ(host->changeParentLayer(3840, 2160), 1);
    EXPECT_EQ(intValue(*host, "colorSpace"), 601) << "message " << message;
  }
}

TEST(Reactions, EditsOfOtherParametersKeepTheColorSpaceFollowingTheLayer) {
  auto host = openHost();
  EXPECT_EQ(host->editParameter("waveformMode", 13), 1);
  EXPECT_EQ(host->editParameter("colorSpaceOld", 14), 1);
  EXPECT_EQ(host->changeParentLayer(1280, 720), 1);
  EXPECT_EQ(intValue(*host, "colorSpace"), 709);
}

TEST(Reactions, LayerChangeWithoutUsableLayerLeavesTheColorSpace) {
  auto host = openHost();
  // No layer reference in the record.
  EXPECT_EQ(host->changeParameter("Effect_Parent_Layer"), 1);
  EXPECT_EQ(intValue(*host, "colorSpace"), 2020);
  // A layer whose information the host cannot give.
  host->faults().failLayerInfo = true;
  EXPECT_EQ(host->changeParentLayer(1280, 720), 1);
  EXPECT_EQ(intValue(*host, "colorSpace"), 2020);
}

TEST(Reactions, InitialAnnouncementsSetTheInitialPanel) {
  vtpl::host::HostSettings settings;  // the editor's behaviour on opening an effect
  auto host = openHost(settings);
  EXPECT_FALSE(visible(*host, "showComparison"));
  EXPECT_FALSE(visible(*host, "overlayChannels"));
  EXPECT_TRUE(visible(*host, "colorSpace"));
  for (const char* id : kRenderToLayerIds) {
    EXPECT_FALSE(visible(*host, id)) << id;
  }
  EXPECT_TRUE(host->unknownParameterIds().empty());
}

}  // namespace
}  // namespace waveform_test

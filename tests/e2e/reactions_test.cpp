// How the module shows and hides parameters and keeps the colour space in step with the layer.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <tuple>

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

const char* const kRenderToLayerIds[] = {"scopePositionTL",
                                         "scopePositionBR",
                                         "renderToLayerShowGuidelines",
                                         "renderToLayerShowsAxisLabel",
                                         "renderToLayerShowStandardColorBars",
                                         "renderToLayerLabelScale",
                                         "renderToLayerBackgroundColor",
                                         "renderToLayerBackgroundAlpha"};

// Each render mode shows its own options; the comparison layer's visibility is set before the
// output channels'.
TEST(Reactions, RenderModeShowsTheOptionsOfEachMode) {
  // The render mode; whether "Comparison Layer" and "Output Channels" are shown.
  const std::tuple<int32_t, bool, bool> cases[] = {
      {1, false, true}, {2, true, false}, {0, false, false}, {1, false, true}};
  std::ostringstream trace;
  auto host = openHost(declaredStateSettings(), &trace);
  for (const auto& [type, showComparison, overlayChannels] : cases) {
    // Start from the opposite so that both calls must happen.
    host->parameters().setVisible("showComparison", !showComparison);
    host->parameters().setVisible("overlayChannels", !overlayChannels);
    trace.str("");
    change(*host, "scopeComparisonType", type);
    EXPECT_EQ(visible(*host, "showComparison"), showComparison) << type;
    EXPECT_EQ(visible(*host, "overlayChannels"), overlayChannels) << type;
    const std::string log = trace.str();
    EXPECT_LT(log.find("setParamVisible(\"showComparison\""),
              log.find("setParamVisible(\"overlayChannels\""))
        << log;
  }
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

// The rule itself (the heights 576 and 1080 divide the spaces) is the unit tests'; here one
// height per space, each from a value the reaction must overwrite. A layer change without a layer
// reference in the record, or with a layer whose information the host cannot give, leaves it.
TEST(Reactions, ColorSpaceFollowsTheLayerHeight) {
  const std::pair<int32_t, int32_t> cases[] = {{720, 709}, {576, 601}, {2160, 2020}};
  auto host = openHost();
  EXPECT_EQ(host->changeParameter("Effect_Parent_Layer"), 1);
  EXPECT_EQ(intValue(*host, "colorSpace"), 2020);
  for (const auto& [height, space] : cases) {
    host->parameters().writeInt("colorSpace", space == 601 ? 2020 : 601);
    EXPECT_EQ(host->changeParentLayer(1920, height), 1);
    EXPECT_EQ(intValue(*host, "colorSpace"), space) << "height " << height;
  }
  host->faults().failLayerInfo = true;
  EXPECT_EQ(host->changeParentLayer(1280, 720), 1);
  EXPECT_EQ(intValue(*host, "colorSpace"), 2020);
}

// Only the user's edit of the colour space itself (either edit message) stops it following the
// layer.
TEST(Reactions, ColorSpaceEditedByHandStopsFollowingTheLayer) {
  const std::tuple<const char*, int32_t, bool> cases[] = {
      {"colorSpace", 13, false},
      {"colorSpace", 14, false},
      {"waveformMode", 13, true},
      {"colorSpaceOld", 14, true},
  };
  for (const auto& [id, message, follows] : cases) {
    auto host = openHost();
    host->parameters().writeInt("colorSpace", 601);
    ASSERT_EQ(host->editParameter(id, message), 1);
    EXPECT_EQ(intValue(*host, "defaultColorSpace"), follows ? 1 : 0) << id << " " << message;
    EXPECT_EQ(host->changeParentLayer(1280, 720), 1);
    EXPECT_EQ(intValue(*host, "colorSpace"), follows ? 709 : 601) << id << " " << message;
  }
}

TEST(Reactions, InitialAnnouncementsSetTheInitialPanel) {
  auto host = openHost(vtpl::host::HostSettings());  // as the editor opens an effect
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

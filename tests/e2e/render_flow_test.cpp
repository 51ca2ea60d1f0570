// When a render analyses, marks the published results stale and asks for a redraw, and when
// the scope control analyses a frame itself, seen through the host's callbacks.
#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <tuple>

#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::host::ControlOptions;
using vtpl::host::EffectHost;
using vtpl::host::FrameOptions;
using vtpl::host::Image;

// A GL host whose trace the test reads.
struct TraceHolder {
  std::ostringstream traceText;
};
class TracedHost : private TraceHolder, public EffectHost {
 public:
  TracedHost() : EffectHost(waveformModule(), glSettings(), &traceText) { open(); }
  // Only an analysis asks for a static-draw buffer (one vertex per grid row).
  int analyses() const {
    const std::string text = traceText.str();
    int count = 0;
    for (size_t at = text.find(kAnalysisBuffer); at != std::string::npos;
         at = text.find(kAnalysisBuffer, at + 1)) {
      ++count;
    }
    return count;
  }

 private:
  static constexpr char kAnalysisBuffer[] = "bytes, 0x88E4)";  // GL_STATIC_DRAW
};

// Whether a render analyses, asks for a redraw or marks the results stale, by whether the frame is
// watched, the controls attached, the identifier, the blend and whether the host stops the render
// at once; stale results make the next control drawing of the frame analyse it itself.
TEST(RenderFlow, DecisionTable) {
  struct Case {
    bool unwatched;
    int attachments;
    bool noIdentifier;
    int32_t blend;
    int stopAt;
    bool analysed;
    bool redrawAsked;
    bool markedStale;
  };
  const Case cases[] = {
      {false, 0, false, 0, -1, false, false, true}, {false, 1, false, 0, -1, true, true, false},
      {false, 0, true, 0, -1, true, true, false},   {false, 0, false, 1, -1, true, true, false},
      {false, 2, true, 9, -1, true, true, false},   {true, 1, false, 0, -1, false, false, false},
      {true, 0, false, 1, -1, true, false, false},  {true, 0, true, 0, -1, false, false, false},
      {false, 0, false, 0, 0, false, false, true},  {false, 0, true, 0, 0, false, false, false},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(testing::Message() << "case " << &c - cases);
    auto host = std::make_unique<TracedHost>();
    ASSERT_TRUE(host->parameters().writeInt("blendType", c.blend));
    for (int i = 0; i < c.attachments; ++i) {
      host->attachControl();
    }
    host->faults().stopAtProgress = c.stopAt;
    host->renderFrame(greyPicture(16, 8), false, FrameOptions{c.unwatched, c.noIdentifier});
    EXPECT_EQ(host->analyses() > 0, c.analysed);
    EXPECT_EQ(host->redrawRequests() > 0, c.redrawAsked);
    ASSERT_EQ(host->drawControl({}), 1);
    EXPECT_EQ(host->callbackCount("fetchOwnLayer") > 0, c.markedStale);
  }
}

// Once the host stops a render at 10, nothing more is analysed or stored: with the comparison
// layer still chosen or taken away since, the control shows the previous render's waveforms, no
// redraw is asked for, and the stopped frame counts as not analysed.
TEST(RenderFlow, StoppedRenderAnalysesAndStoresNothingMore) {
  for (const bool comparisonKept : {true, false}) {
    SCOPED_TRACE(testing::Message() << "comparison kept " << comparisonKept);
    auto host = std::make_unique<TracedHost>();
    host->attachControl();
    host->setComparisonLayer(greyPicture(16, 8));
    host->renderFrame(greyPicture(16, 8));
    ASSERT_EQ(host->drawControl({}), 1);
    const Image before = host->controlPicture();
    if (!comparisonKept) {
      host->setComparisonLayer(Image{});
    }
    host->faults().stopAtProgress = 10;
    host->renderFrame(greyPicture(16, 8), false, FrameOptions{false, false, 3});
    EXPECT_EQ(host->analyses(), 2);
    EXPECT_EQ(host->redrawRequests(), 1);
    ASSERT_EQ(host->drawControl({}), 1);
    EXPECT_TRUE(host->controlPicture().rgba == before.rgba) << "the control's picture changed";
    // A forced drawing of frame 3 analyses it: the stopped render did not record frame 3.
    host->drawControl(ControlOptions{3, 5, true});
    EXPECT_EQ(host->callbackCount("fetchOwnLayer"), 1);
  }
}

// Which layers a render mode shows is the layout's unit tests'; here one case of each outcome,
// analysed by the render and by the control.
TEST(RenderFlow, ComparisonLayerIsAnalysedAsTheRenderModeAsks) {
  // A comparison layer chosen, the render mode, "Comparison Layer", the analyses.
  const std::tuple<bool, int32_t, bool, int> cases[] = {
      {false, 0, true, 1}, {true, 0, true, 2}, {true, 2, true, 1}, {true, 2, false, 1}};
  for (const auto& [comparison, type, show, analyses] : cases) {
    for (const bool onInterfaceThread : {false, true}) {
      SCOPED_TRACE(testing::Message() << "comparison " << comparison << ", type " << type
                                      << ", show " << show << ", interface " << onInterfaceThread);
      auto host = std::make_unique<TracedHost>();
      host->parameters().writeInt("scopeComparisonType", type);
      host->parameters().writeBool("showComparison", show);
      if (comparison) {
        host->setComparisonLayer(greyPicture(16, 8));
      }
      if (onInterfaceThread) {
        host->renderFrame(greyPicture(16, 8));  // nothing attached: the control analyses
        host->drawControl({});
      } else {
        host->attachControl();
        host->renderFrame(greyPicture(16, 8));
      }
      EXPECT_EQ(host->analyses(), analyses);
      EXPECT_EQ(host->callbackCount("fetchLayer"), comparison ? 1 : 0);
    }
  }
}

TEST(RenderFlow, ComparisonLayersTheEffectCannotUseAreLeftOut) {
  struct Case {
    const char* what;
    bool chosen;
    uint32_t kind;
    int32_t frameCount;
    int32_t frameIndex;
    bool failFetch;
    int fetches;
  };
  const Case cases[] = {
      {"usable", true, 0, 1, 0, false, 1},
      {"usable kind 7", true, 7, 3, 2, false, 1},
      {"chosen, then cleared", false, 0, 1, 0, false, 0},
      {"kind 2", true, 2, 1, 0, false, 0},
      {"kind 5", true, 5, 1, 0, false, 0},
      {"kind 9", true, 9, 1, 0, false, 0},
      {"frame past the end", true, 0, 2, 2, false, 0},
      {"layer without frames", true, 0, 0, 0, false, 0},
      {"fetch fails", true, 0, 1, 0, true, 1},
  };
  for (const Case& c : cases) {
    auto host = std::make_unique<TracedHost>();
    host->attachControl();
    vtpl::host::HostLayer* layer = host->setComparisonLayer(greyPicture(16, 8));
    ASSERT_NE(layer, nullptr);
    layer->info.kind = c.kind;
    layer->info.frameCount = c.frameCount;
    if (!c.chosen) {
      EXPECT_EQ(host->setComparisonLayer(Image{}), nullptr);
    }
    host->faults().failFetchLayer = c.failFetch;
    // The render goes on without the comparison.
    host->renderFrame(greyPicture(16, 8), false, FrameOptions{false, false, c.frameIndex});
    const bool usable = c.fetches == 1 && !c.failFetch;
    EXPECT_EQ(host->analyses(), usable ? 2 : 1) << c.what;
    EXPECT_EQ(host->callbackCount("fetchLayer"), c.fetches) << c.what;
    EXPECT_EQ(host->callbackCount("releaseLayer"), usable ? 1 : 0) << c.what;
  }
}

TEST(RenderFlow, ControlAnalysesAStaleFrameOnlyOnce) {
  auto host = std::make_unique<TracedHost>();
  host->renderFrame(greyPicture(16, 8));  // nothing attached: results marked stale
  ASSERT_EQ(host->analyses(), 0);
  // Frame 0, then again, also forced: it is already analysed. Frames outside the clip's frame
  // count and drawings without identifier never analyse.
  const ControlOptions drawings[] = {{}, {}, {0, 1, true}, {4, 4, true}, {2, 4, true, true}};
  for (const ControlOptions& drawing : drawings) {
    host->drawControl(drawing);
    EXPECT_EQ(host->callbackCount("fetchOwnLayer"), 1) << "frame " << drawing.frameIndex;
    EXPECT_EQ(host->analyses(), 1) << "frame " << drawing.frameIndex;
  }
  EXPECT_EQ(host->callbackCount("releaseLayer"), 1);
}

}  // namespace
}  // namespace waveform_test

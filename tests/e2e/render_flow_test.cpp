// When a render analyses, marks the published results stale and asks for a redraw, and when
// the scope control analyses a frame itself, seen through the host's callbacks.
#include <gtest/gtest.h>

#include <sstream>
#include <string>

#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::host::ControlOptions;
using vtpl::host::EffectHost;
using vtpl::host::FrameOptions;
using vtpl::host::Image;

Image greyPicture() {
  Image picture;
  picture.width = 16;
  picture.height = 8;
  picture.rgba.assign(4 * 16 * 8, 0.5f);
  for (size_t i = 3; i < picture.rgba.size(); i += 4) {
    picture.rgba[i] = 1.0f;
  }
  return picture;
}

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
  static vtpl::host::HostSettings glSettings() {
    vtpl::host::HostSettings settings = declaredStateSettings();
    settings.gl = true;
    return settings;
  }
};

std::unique_ptr<TracedHost> openGlHost() {
  return std::make_unique<TracedHost>();
}

int analyses(const TracedHost& host) {
  return host.analyses();
}
int ownLayerFetches(const EffectHost& host) {
  return host.callbackCount("fetchOwnLayer");
}

TEST(RenderFlow, DecisionTable) {
  struct Case {
    bool unwatched;
    int attachments;
    bool noIdentifier;
    int32_t blend;
    bool analysed;
    bool redrawAsked;
    bool markedStale;
  };
  const Case cases[] = {
      {false, 0, false, 0, false, false, true}, {false, 1, false, 0, true, true, false},
      {false, 0, true, 0, true, true, false},   {false, 0, false, 1, true, true, false},
      {false, 2, true, 9, true, true, false},   {true, 1, false, 0, false, false, false},
      {true, 0, false, 1, true, false, false},  {true, 0, true, 0, false, false, false},
  };
  for (const Case& c : cases) {
    const std::string what = "unwatched " + std::to_string(c.unwatched) + ", attached " +
                             std::to_string(c.attachments) + ", no identifier " +
                             std::to_string(c.noIdentifier) + ", blend " + std::to_string(c.blend);
    auto host = openGlHost();
    ASSERT_TRUE(host->parameters().writeInt("blendType", c.blend)) << what;
    for (int i = 0; i < c.attachments; ++i) {
      host->attachControl();
    }
    FrameOptions frame;
    frame.unwatched = c.unwatched;
    frame.noIdentifier = c.noIdentifier;
    host->renderFrame(greyPicture(), false, frame);
    EXPECT_EQ(analyses(*host) > 0, c.analysed) << what;
    EXPECT_EQ(host->redrawRequests() > 0, c.redrawAsked) << what;
    // Stale results make the next control drawing of the frame analyse it itself.
    ASSERT_EQ(host->drawControl({}), 1) << what;
    EXPECT_EQ(ownLayerFetches(*host) > 0, c.markedStale) << what;
  }
}

TEST(RenderFlow, StopAtTenLeavesTheAnalysedFrameUnchanged) {
  for (const bool stop : {false, true}) {
    auto host = openGlHost();
    host->attachControl();
    host->faults().stopAtProgress = stop ? 10 : -1;
    FrameOptions frame;
    frame.frameIndex = 3;
    host->renderFrame(greyPicture(), false, frame);
    EXPECT_EQ(host->redrawRequests(), stop ? 0 : 1);
    // A forced drawing of frame 3 analyses only if the render did not record frame 3.
    ControlOptions control;
    control.frameIndex = 3;
    control.frameCount = 5;
    control.force = true;
    host->drawControl(control);
    EXPECT_EQ(ownLayerFetches(*host), stop ? 1 : 0) << "stop " << stop;
  }
}

TEST(RenderFlow, StoppedRenderWithoutIdentifierKeepsTheResults) {
  for (const bool noIdentifier : {false, true}) {
    auto host = openGlHost();
    host->faults().stopAtProgress = 0;
    FrameOptions frame;
    frame.noIdentifier = noIdentifier;
    host->renderFrame(greyPicture(), false, frame);
    EXPECT_EQ(analyses(*host), 0);
    host->drawControl({});
    EXPECT_EQ(ownLayerFetches(*host), noIdentifier ? 0 : 1) << "no identifier " << noIdentifier;
  }
}

TEST(RenderFlow, ComparisonLayerIsAnalysedAsTheRenderModeAsks) {
  struct Case {
    bool comparison;
    int32_t type;
    bool show;
    int analyses;
  };
  const Case cases[] = {
      {false, 0, true, 1}, {true, 0, true, 2},  {true, 1, false, 2},
      {true, 2, true, 1},  {true, 2, false, 1}, {false, 2, true, 1},
  };
  for (const Case& c : cases) {
    const std::string what = "comparison " + std::to_string(c.comparison) + ", type " +
                             std::to_string(c.type) + ", show " + std::to_string(c.show);
    for (const bool onInterfaceThread : {false, true}) {
      auto host = openGlHost();
      host->parameters().writeInt("scopeComparisonType", c.type);
      host->parameters().writeBool("showComparison", c.show);
      if (c.comparison) {
        host->setComparisonLayer(greyPicture());
      }
      if (onInterfaceThread) {
        host->renderFrame(greyPicture());  // nothing attached: the control analyses
        host->drawControl({});
      } else {
        host->attachControl();
        host->renderFrame(greyPicture());
      }
      EXPECT_EQ(analyses(*host), c.analyses) << what << " interface " << onInterfaceThread;
      EXPECT_EQ(host->callbackCount("fetchLayer"), c.comparison ? 1 : 0) << what;
      // Every layer fetched from the host goes back to it.
      EXPECT_EQ(host->callbackCount("releaseLayer"),
                host->callbackCount("fetchLayer") + ownLayerFetches(*host))
          << what;
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
      {"none chosen", false, 0, 1, 0, false, 0},
      {"kind 2", true, 2, 1, 0, false, 0},
      {"kind 5", true, 5, 1, 0, false, 0},
      {"kind 9", true, 9, 1, 0, false, 0},
      {"frame past the end", true, 0, 2, 2, false, 0},
      {"layer without frames", true, 0, 0, 0, false, 0},
      {"fetch fails", true, 0, 1, 0, true, 1},
  };
  for (const Case& c : cases) {
    auto host = openGlHost();
    host->attachControl();
    if (c.chosen) {
      vtpl::host::HostLayer* layer = host->setComparisonLayer(greyPicture());
      ASSERT_NE(layer, nullptr);
      layer->info.kind = c.kind;
      layer->info.frameCount = c.frameCount;
    }
    host->faults().failFetchLayer = c.failFetch;
    FrameOptions frame;
    frame.frameIndex = c.frameIndex;
    // The render goes on without the comparison: the layer still reaches the output.
    const Image output = host->renderFrame(greyPicture(), false, frame);
    ASSERT_EQ(output.rgba.size(), greyPicture().rgba.size()) << c.what;
    for (size_t i = 0; i < output.rgba.size(); ++i) {
      ASSERT_NEAR(output.rgba[i], greyPicture().rgba[i], 1.0 / 255) << c.what << " value " << i;
    }
    const bool usable = c.fetches == 1 && !c.failFetch;
    EXPECT_EQ(analyses(*host), usable ? 2 : 1) << c.what;
    EXPECT_EQ(host->callbackCount("fetchLayer"), c.fetches) << c.what;
    EXPECT_EQ(host->callbackCount("releaseLayer"), usable ? 1 : 0) << c.what;
  }
}

TEST(RenderFlow, ControlAnalysesAStaleFrameOnlyOnce) {
  auto host = openGlHost();
  host->renderFrame(greyPicture());  // nothing attached: results marked stale
  ASSERT_EQ(analyses(*host), 0);
  host->drawControl({});
  EXPECT_EQ(ownLayerFetches(*host), 1);
  EXPECT_EQ(analyses(*host), 1);
  host->drawControl({});
  ControlOptions forced;
  forced.force = true;
  host->drawControl(forced);
  EXPECT_EQ(ownLayerFetches(*host), 1);  // frame 0 is already analysed
  // Frames outside the clip's frame count and drawings without identifier never analyse.
  ControlOptions outside;
  outside.frameIndex = 4;
  outside.frameCount = 4;
  outside.force = true;
  host->drawControl(outside);
  ControlOptions anonymous;
  anonymous.frameIndex = 2;
  anonymous.frameCount = 4;
  anonymous.force = true;
  anonymous.noIdentifier = true;
  host->drawControl(anonymous);
  EXPECT_EQ(ownLayerFetches(*host), 1);
  EXPECT_EQ(host->callbackCount("releaseLayer"), 1);
}

}  // namespace
}  // namespace waveform_test

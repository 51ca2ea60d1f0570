// Which waveforms the scope shows and where: the layout decision, the overlay routing and where
// the two corner points put the scope in the frame.
#include <gtest/gtest.h>

#include <string>
#include <tuple>
#include <utility>

#include "scope/render_to_layer.h"
#include "scope/scope_layout.h"

namespace {

using namespace plugin::Scopes;

TEST(ScopeLayout, EveryCombinationOfLayersTypeAndShowComparison) {
  using A = ScopeArrangement;
  struct Case {
    bool primary, comparison;
    int32_t type;
    bool show;
    bool drawPrimary, drawComparison;
    A arrangement;
  };
  const Case cases[] = {
      // Side by side (0), overlay (1), single scope (2).
      {true, true, 0, false, true, true, A::kSideBySide},
      {true, true, 0, true, true, true, A::kSideBySide},
      {true, true, 1, false, true, true, A::kOverlay},
      {true, true, 1, true, true, true, A::kOverlay},
      {true, true, 2, false, true, false, A::kSingle},
      {true, true, 2, true, false, true, A::kSingle},
      // Without a comparison every type shows the primary alone.
      {true, false, 0, false, true, false, A::kSingle},
      {true, false, 0, true, true, false, A::kSingle},
      {true, false, 1, true, true, false, A::kSingle},
      {true, false, 2, true, true, false, A::kSingle},
      // Without a primary the comparison is shown alone unless single scope hides it.
      {false, true, 0, false, false, true, A::kSingle},
      {false, true, 1, true, false, true, A::kSingle},
      {false, true, 2, false, false, false, A::kEmpty},
      {false, true, 2, true, false, true, A::kSingle},
      {false, false, 0, true, false, false, A::kEmpty},
      {false, false, 2, false, false, false, A::kEmpty},
      // An unknown type with both present shows the primary alone.
      {true, true, 7, false, true, false, A::kSingle},
  };
  for (const Case& c : cases) {
    const std::string what = "primary " + std::to_string(c.primary) + ", comparison " +
                             std::to_string(c.comparison) + ", type " + std::to_string(c.type) +
                             ", show " + std::to_string(c.show);
    const ScopeLayout layout = decideLayout(c.primary, c.comparison, c.type, c.show);
    EXPECT_EQ(layout.drawPrimary, c.drawPrimary) << what;
    EXPECT_EQ(layout.drawComparison, c.drawComparison) << what;
    EXPECT_EQ(layout.arrangement, c.arrangement) << what;
  }
}

TEST(ScopeLayout, OverlayRoutesEachScopeToItsChannel) {
  constexpr ChannelMask r{true, false, false}, g{false, true, false}, b{false, false, true};
  const ChannelMask expected[][2] = {{r, g}, {r, b}, {g, r}, {g, b}, {b, r}, {b, g}};
  const auto same = [](const ChannelMask& x, const ChannelMask& y) {
    return x.red == y.red && x.green == y.green && x.blue == y.blue;
  };
  for (int32_t value = 0; value < 6; ++value) {
    const OverlayRouting routing = overlayRouting(value);
    EXPECT_TRUE(same(routing.primary, expected[value][0])) << value;
    EXPECT_TRUE(same(routing.comparison, expected[value][1])) << value;
  }
  EXPECT_TRUE(same(overlayRouting(42).primary, r));
  EXPECT_TRUE(same(overlayRouting(-1).comparison, g));
}

TEST(ScopePlacement, DefaultCornersCoverAWholeHdFrameAndSwappedOnesMirror) {
  const auto area = [](const ScopePlacement& p) {
    return std::tuple(p.left, p.bottom, p.right, p.top, p.textureWidth, p.textureHeight);
  };
  const auto placement = placeScope({-640, 360}, {640, -360}, 1280, 720);
  const auto swapped = placeScope({640, -360}, {-640, 360}, 1280, 720);
  ASSERT_TRUE(placement && swapped);
  EXPECT_EQ(area(*placement), std::tuple(0.0f, 0.0f, 1280.0f, 720.0f, 1280u, 720u));
  EXPECT_EQ(area(*swapped), area(*placement));
  EXPECT_EQ(std::pair(placement->mirrorX, placement->mirrorY), std::pair(false, false));
  EXPECT_EQ(std::pair(swapped->mirrorX, swapped->mirrorY), std::pair(true, true));
}

TEST(ScopePlacement, AreasUnderSixteenPixelsAreNotDrawn) {
  struct Case {
    float width, height;
    bool drawn;
  };
  const Case cases[] = {{15, 100, false},
                        {100, 15, false},
                        {16, 16, true},
                        {15.25f, 40, true},  // rounds up to 16
                        {0, 0, false}};
  for (const Case& c : cases) {
    const auto placement = placeScope({-10, 50}, {-10 + c.width, 50 - c.height}, 200, 200);
    EXPECT_EQ(placement.has_value(), c.drawn) << c.width << " x " << c.height;
  }
  const float nan = std::numeric_limits<float>::quiet_NaN();
  EXPECT_FALSE(placeScope({nan, 0}, {100, -100}, 200, 200));
}

TEST(ScopePlacement, TextureRectanglesFollowAllocationsAndMirroring) {
  const auto placement = placeScope({-40, 20}, {10.5f, -30}, 100, 80);  // 50.5 x 50 pixels
  ASSERT_TRUE(placement);
  EXPECT_EQ(placement->textureWidth, 51u);
  vtpl::HostTexture layer{};
  layer.allocatedWidth = 128;
  layer.allocatedHeight = 128;
  layer.factor1 = 1;
  layer.factor2 = 0.5f;
  const std::array<float, 4> onLayer = layerRectangle(*placement, layer);
  EXPECT_FLOAT_EQ(onLayer[0], 10.0f / 128);
  EXPECT_FLOAT_EQ(onLayer[1], 10.0f / 128 * 0.5f);
  EXPECT_FLOAT_EQ(onLayer[2], 60.5f / 128);
  EXPECT_FLOAT_EQ(onLayer[3], 60.0f / 128 * 0.5f);

  vtpl::HostTexture scope{};
  scope.uMax = 51.0f / 64;
  scope.vMax = 50.0f / 64;
  const std::array<float, 4> onScope = scopeRectangle(*placement, scope);
  EXPECT_FLOAT_EQ(onScope[0], 0);
  EXPECT_FLOAT_EQ(onScope[2], 50.5f / 64);  // only the exact width of the scope is used
  EXPECT_FLOAT_EQ(onScope[3], 50.0f / 64);

  const auto mirrored = placeScope({10.5f, -30}, {-40, 20}, 100, 80);
  const std::array<float, 4> reversed = scopeRectangle(*mirrored, scope);
  EXPECT_FLOAT_EQ(reversed[0], 50.5f / 64);
  EXPECT_FLOAT_EQ(reversed[1], 50.0f / 64);
  EXPECT_FLOAT_EQ(reversed[2], 0);
  EXPECT_FLOAT_EQ(reversed[3], 0);
}

}  // namespace

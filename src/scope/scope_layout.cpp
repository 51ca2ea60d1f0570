#include "scope/scope_layout.h"

#include "scope/parameter_choices.h"

namespace plugin::Scopes {
namespace {

constexpr ChannelMask kRed{true, false, false};
constexpr ChannelMask kGreen{false, true, false};
constexpr ChannelMask kBlue{false, false, true};

}  // namespace

LayerChoice chooseLayers(bool comparisonPresent, int32_t comparisonType, bool showComparison) {
  const bool singleScope = comparisonType == kComparisonSingleScope;
  return {comparisonPresent && (!singleScope || showComparison),
          !(comparisonPresent && singleScope && showComparison)};
}

ScopeLayout decideLayout(bool hasPrimary, bool hasComparison, int32_t comparisonType,
                         bool showComparison) {
  const LayerChoice shown = chooseLayers(hasComparison, comparisonType, showComparison);
  ScopeLayout layout;
  layout.drawComparison = shown.comparison;
  layout.drawPrimary = hasPrimary && shown.own;
  if (layout.drawPrimary && layout.drawComparison && comparisonType == kComparisonOverlay) {
    layout.arrangement = ScopeArrangement::kOverlay;
  } else if (layout.drawPrimary && layout.drawComparison &&
             comparisonType == kComparisonSideBySide) {
    layout.arrangement = ScopeArrangement::kSideBySide;
  } else if (layout.drawPrimary || layout.drawComparison) {
    // Both present with an unknown comparison type still show one scope: the primary.
    layout.drawComparison = layout.drawComparison && !layout.drawPrimary;
    layout.arrangement = ScopeArrangement::kSingle;
  }
  return layout;
}

OverlayRouting overlayRouting(int32_t overlayChannels) {
  switch (overlayChannels) {
    case kOverlayRB:
      return {kRed, kBlue};
    case kOverlayGR:
      return {kGreen, kRed};
    case kOverlayGB:
      return {kGreen, kBlue};
    case kOverlayBR:
      return {kBlue, kRed};
    case kOverlayBG:
      return {kBlue, kGreen};
    case kOverlayRG:
    default:
      return {kRed, kGreen};
  }
}

}  // namespace plugin::Scopes

// Which waveforms the scope shows and how they share the panel: one scope, two side by side, or
// two overlaid in separate colour channels.
#ifndef WAVEFORM_SCOPE_SCOPE_LAYOUT_H
#define WAVEFORM_SCOPE_SCOPE_LAYOUT_H

#include <cstdint>

namespace plugin::Scopes {

struct LayerChoice {
  bool comparison;
  bool own;
};
// Single Scope with "Comparison Layer" on shows only the comparison; otherwise both are shown
// when present.
LayerChoice chooseLayers(bool comparisonPresent, int32_t comparisonType, bool showComparison);

enum class ScopeArrangement { kEmpty, kSingle, kSideBySide, kOverlay };

struct ScopeLayout {
  bool drawPrimary = false;
  bool drawComparison = false;
  ScopeArrangement arrangement = ScopeArrangement::kEmpty;
};
ScopeLayout decideLayout(bool hasPrimary, bool hasComparison, int32_t comparisonType,
                         bool showComparison);

struct ChannelMask {
  bool red, green, blue;
};
// The output channels each overlaid scope is written to.
struct OverlayRouting {
  ChannelMask primary;
  ChannelMask comparison;
};
// An unknown value routes as RG.
OverlayRouting overlayRouting(int32_t overlayChannels);

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_SCOPE_LAYOUT_H

// The parameter values the scope passes work from. The plug-in reads them from the host once
// per message; the passes take them as plain values and never call back for a parameter.
#ifndef WAVEFORM_SCOPE_SCOPE_SETTINGS_H
#define WAVEFORM_SCOPE_SCOPE_SETTINGS_H

#include <array>
#include <cstdint>

namespace plugin::Scopes {

using FramePoint = std::array<float, 2>;  // relative to the frame's centre, x right, y up

// How the comparison layer is shown: "scopeComparisonType" and "showComparison".
struct ComparisonSettings {
  int32_t type = 0;
  bool showComparison = false;
};

// What the analysis pass measures and how.
struct AnalysisSettings {
  int32_t mode = 0;            // "waveformMode"
  float directionDegrees = 0;  // "waveformDirection"
  int32_t downsample = 0;      // "analysisDownsample"
  int32_t colorSpace = 0;      // "colorSpace"
  float brightness = 0;        // "waveformBrightness"
  FramePoint clipStart{};      // "clipStartPos"
  FramePoint clipEnd{};        // "clipEndPos"
};

// How the scope picture arranges and colours the waveforms.
struct CompositionSettings {
  int32_t mode = 0;  // "waveformMode": the display colours and whether markers are drawn
  ComparisonSettings comparison;
  int32_t overlayChannels = 0;  // "overlayChannels"
  int32_t colorSpace = 0;       // "colorSpace": the colour-bar markers' luma weights
};

// The IRE labels beside the guidelines.
struct LabelSettings {
  bool show = false;  // "showsAxisLabel" or "renderToLayerShowsAxisLabel"
  float scaleX = 1;
  float scaleY = 1;
  bool interfaceThread = false;  // set in the interface thread's text state
};

// The scope rendered into the layer: where, with what, and how it is blended.
struct RenderToLayerSettings {
  int32_t blend = 0;                        // "blendType"
  FramePoint topLeft{};                     // "scopePositionTL"
  FramePoint bottomRight{};                 // "scopePositionBR"
  bool showGuidelines = false;              // "renderToLayerShowGuidelines"
  bool showAxisLabels = false;              // "renderToLayerShowsAxisLabel"
  bool showColourBars = false;              // "renderToLayerShowStandardColorBars"
  float labelScale = 1;                     // "renderToLayerLabelScale"
  std::array<float, 3> backgroundColour{};  // "renderToLayerBackgroundColor"
  float backgroundAlpha = 0;                // "renderToLayerBackgroundAlpha"
};

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_SCOPE_SETTINGS_H

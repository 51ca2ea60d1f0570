// The ids of the effect's parameters: the only key by which values are read back from the host.
#ifndef WAVEFORM_PLUGIN_PARAMETER_IDS_H
#define WAVEFORM_PLUGIN_PARAMETER_IDS_H

namespace plugin::Scopes::ParamId {

inline constexpr char kWaveformControl[] = "waveformControl";
inline constexpr char kWaveformMode[] = "waveformMode";
inline constexpr char kWaveformDirection[] = "waveformDirection";
inline constexpr char kWaveformBrightness[] = "waveformBrightness";
inline constexpr char kClipStartPos[] = "clipStartPos";
inline constexpr char kClipEndPos[] = "clipEndPos";
inline constexpr char kOverlayLayer[] = "overlayLayer";
inline constexpr char kScopeComparisonType[] = "scopeComparisonType";
inline constexpr char kShowComparison[] = "showComparison";
inline constexpr char kOverlayChannels[] = "overlayChannels";
inline constexpr char kAnalysisDownsample[] = "analysisDownsample";
inline constexpr char kDefaultColorSpace[] = "defaultColorSpace";
inline constexpr char kColorSpace[] = "colorSpace";
inline constexpr char kShowGuidelines[] = "showGuidelines";
inline constexpr char kShowsAxisLabel[] = "showsAxisLabel";
inline constexpr char kShowStandardColorBars[] = "showStandardColorBars";
inline constexpr char kBlendType[] = "blendType";
inline constexpr char kScopePositionTL[] = "scopePositionTL";
inline constexpr char kScopePositionBR[] = "scopePositionBR";
inline constexpr char kRenderToLayerShowGuidelines[] = "renderToLayerShowGuidelines";
inline constexpr char kRenderToLayerShowStandardColorBars[] = "renderToLayerShowStandardColorBars";
inline constexpr char kRenderToLayerShowsAxisLabel[] = "renderToLayerShowsAxisLabel";
inline constexpr char kRenderToLayerLabelScale[] = "renderToLayerLabelScale";
inline constexpr char kRenderToLayerBackgroundColor[] = "renderToLayerBackgroundColor";
inline constexpr char kRenderToLayerBackgroundAlpha[] = "renderToLayerBackgroundAlpha";

}  // namespace plugin::Scopes::ParamId

#endif  // WAVEFORM_PLUGIN_PARAMETER_IDS_H

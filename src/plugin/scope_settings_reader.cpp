#include "plugin/scope_settings_reader.h"

#include "plugin/parameter_ids.h"

namespace plugin::Scopes {
namespace {

using Plugin::host::HostCalls;
using vtpl::HostEffectRecord;

constexpr int32_t kLayoutTime = 0;

float readFloat(const HostCalls& host, const char* id, int32_t time) {
  return host.call(&HostEffectRecord::getFloat, id, time);
}

FramePoint readPoint(const HostCalls& host, const char* id, int32_t time) {
  FramePoint point{};
  host.call(&HostEffectRecord::getPoint, id, time, &point[0], &point[1]);
  return point;
}

}  // namespace

bool readBool(const HostCalls& host, const char* id, int32_t time) {
  return host.call(&HostEffectRecord::getBool, id, time) != 0;
}

int32_t readInt(const HostCalls& host, const char* id, int32_t time) {
  return host.call(&HostEffectRecord::getInt, id, time);
}

ComparisonSettings readComparisonSettings(const HostCalls& host, int32_t time) {
  ComparisonSettings settings;
  settings.showComparison = readBool(host, ParamId::kShowComparison, time);
  settings.type = readInt(host, ParamId::kScopeComparisonType, kLayoutTime);
  return settings;
}

AnalysisSettings readAnalysisSettings(const HostCalls& host, int32_t time) {
  AnalysisSettings settings;
  settings.mode = readInt(host, ParamId::kWaveformMode, time);
  settings.directionDegrees =
      host.call(&HostEffectRecord::getAngle, ParamId::kWaveformDirection, time);
  settings.downsample = readInt(host, ParamId::kAnalysisDownsample, time);
  settings.colorSpace = readInt(host, ParamId::kColorSpace, time);
  settings.brightness = readFloat(host, ParamId::kWaveformBrightness, time);
  settings.clipStart = readPoint(host, ParamId::kClipStartPos, time);
  settings.clipEnd = readPoint(host, ParamId::kClipEndPos, time);
  return settings;
}

CompositionSettings readCompositionSettings(const HostCalls& host) {
  CompositionSettings settings;
  settings.mode = readInt(host, ParamId::kWaveformMode, kLayoutTime);
  settings.comparison = readComparisonSettings(host, kLayoutTime);
  settings.overlayChannels = readInt(host, ParamId::kOverlayChannels, kLayoutTime);
  settings.colorSpace = readInt(host, ParamId::kColorSpace, kLayoutTime);
  return settings;
}

int32_t readBlendType(const HostCalls& host, int32_t time) {
  return readInt(host, ParamId::kBlendType, time);
}

RenderToLayerSettings readRenderToLayerSettings(const HostCalls& host, int32_t time) {
  RenderToLayerSettings settings;
  settings.blend = readBlendType(host, time);
  settings.topLeft = readPoint(host, ParamId::kScopePositionTL, time);
  settings.bottomRight = readPoint(host, ParamId::kScopePositionBR, time);
  settings.showGuidelines = readBool(host, ParamId::kRenderToLayerShowGuidelines, time);
  settings.showAxisLabels = readBool(host, ParamId::kRenderToLayerShowsAxisLabel, time);
  settings.showColourBars = readBool(host, ParamId::kRenderToLayerShowStandardColorBars, time);
  settings.labelScale = readFloat(host, ParamId::kRenderToLayerLabelScale, time);
  auto& [red, green, blue] = settings.backgroundColour;
  host.call(&HostEffectRecord::getColor, ParamId::kRenderToLayerBackgroundColor, time, &red, &green,
            &blue);
  settings.backgroundAlpha = readFloat(host, ParamId::kRenderToLayerBackgroundAlpha, time);
  return settings;
}

}  // namespace plugin::Scopes

#include "plugin/parameter_reactions.h"

#include <initializer_list>
#include <string_view>

#include "plugin/parameter_ids.h"
#include "plugin/scope_settings_reader.h"
#include "scope/parameter_choices.h"

namespace plugin::Scopes {
namespace {

using Plugin::host::HostCalls;
using vtpl::HostEffectRecord;
namespace id = ParamId;

constexpr int32_t kTimeZero = 0;

void setVisible(const HostCalls& host, const char* paramId, bool visible) {
  const uint8_t shown = visible ? 1 : 0;
  host.call(&HostEffectRecord::setParamVisible, paramId, &shown);
}

void showComparisonOptions(const HostCalls& host) {
  const int32_t type = readInt(host, id::kScopeComparisonType, kTimeZero);
  setVisible(host, id::kShowComparison, type == kComparisonSingleScope);
  setVisible(host, id::kOverlayChannels, type == kComparisonOverlay);
}

void showColorSpace(const HostCalls& host) {
  const int32_t mode = readInt(host, id::kWaveformMode, kTimeZero);
  setVisible(host, id::kColorSpace, mode == kModeLuminance || mode == kModeCbCr);
}

void showRenderToLayerOptions(const HostCalls& host) {
  const bool blending = readInt(host, id::kBlendType, kTimeZero) != kBlendNone;
  for (const char* paramId :
       {id::kScopePositionTL, id::kScopePositionBR, id::kRenderToLayerShowGuidelines,
        id::kRenderToLayerShowsAxisLabel, id::kRenderToLayerShowStandardColorBars,
        id::kRenderToLayerLabelScale, id::kRenderToLayerBackgroundColor,
        id::kRenderToLayerBackgroundAlpha}) {
    setVisible(host, paramId, blending);
  }
}

// While the colour space follows the layer, pick it from the new layer's height.
void followLayerColorSpace(const HostCalls& host) {
  if (!readBool(host, id::kDefaultColorSpace, kTimeZero)) {
    return;
  }
  const auto* reference = static_cast<const vtpl::HostLayerReference*>(host.record().messageRecord);
  if (reference == nullptr || reference->layer == nullptr) {
    return;
  }
  vtpl::HostLayerInfo info{};
  if (host.call(&HostEffectRecord::getLayerInfo, reference->layer, reference->time, &info) !=
      vtpl::kStatusOk) {
    return;
  }
  host.call(&HostEffectRecord::setInt, id::kColorSpace, kTimeZero,
            colorSpaceForLayerHeight(info.height), 0);
}

}  // namespace

int32_t colorSpaceForLayerHeight(int32_t height) {
  if (height > 1080) {
    return kRec2020;
  }
  if (height > 576) {
    return kRec709;
  }
  return kRec601;
}

void parameterChanged(const HostCalls& host, const char* changedId) {
  if (changedId == nullptr) {
    return;
  }
  const std::string_view changed(changedId);
  if (changed == id::kScopeComparisonType) {
    showComparisonOptions(host);
  } else if (changed == id::kWaveformMode) {
    showColorSpace(host);
  } else if (changed == kEffectParentLayer) {
    followLayerColorSpace(host);
  } else if (changed == id::kBlendType) {
    showRenderToLayerOptions(host);
  }
}

void parameterEdited(const HostCalls& host, const char* changedId) {
  if (changedId != nullptr && std::string_view(changedId) == id::kColorSpace) {
    host.call(&HostEffectRecord::setBool, id::kDefaultColorSpace, kTimeZero, uint8_t{0}, 0);
  }
}

}  // namespace plugin::Scopes

#include "plugin/parameter_declarations.h"

#include <vector>

#include "plugin/parameter_ids.h"
#include "scope/parameter_choices.h"

namespace plugin::Scopes {
namespace {

using Plugin::host::HostCalls;
using vtpl::HostEffectRecord;
namespace id = ParamId;

constexpr char16_t kEmpty[] = u"";

// The flag words passed with each declaration belong to the host and are passed as they stand.

// The control's aspect is 5/3 as a float, widened to the double the host takes.
constexpr double kControlAspect = static_cast<double>(5.0f / 3.0f);
constexpr uint8_t kAngleOption = 1;
constexpr float kBackgroundGrey = 47.0f / 255.0f;

void beginGroup(const HostCalls& host, const char16_t* label) {
  host.declare(&HostEffectRecord::beginGroup, label);
}

void endGroup(const HostCalls& host) {
  host.declare(&HostEffectRecord::endGroup);
}

void defineBool(const HostCalls& host, const char16_t* label, const char* paramId, uint32_t flags,
                bool defaultValue) {
  host.declare(&HostEffectRecord::defineBool, label, paramId, flags,
               static_cast<uint8_t>(defaultValue));
}

void definePoint(const HostCalls& host, const char16_t* label, const char* paramId, uint32_t flags,
                 float x, float y) {
  host.declare(&HostEffectRecord::definePoint, label, paramId, flags, x, y);
}

void defineFloat(const HostCalls& host, const char16_t* label, const char* paramId, uint32_t flags,
                 float min, float max, float defaultValue) {
  constexpr int32_t kDecimals = 2;
  host.declare(&HostEffectRecord::defineFloat, label, kEmpty, paramId, flags, min, max,
               defaultValue, kDecimals);
}

template <typename Items>
void defineChoice(const HostCalls& host, const char16_t* label, const char* paramId, uint32_t flags,
                  const Items& items, int32_t defaultIndex) {
  const std::u16string texts = joinChoiceTexts(items);
  std::vector<int32_t> values;
  for (const ChoiceItem& item : items) {
    values.push_back(item.value);
  }
  host.declare(&HostEffectRecord::defineChoice, label, paramId, flags, texts.c_str(), values.data(),
               defaultIndex);
}

void declareControl(const HostCalls& host) {
  // The host's answer is not checked: a host without custom controls still gets the parameters.
  host.call(&HostEffectRecord::defineControl, kEmpty, id::kWaveformControl, 0x60, kEmpty,
            kControlAspect, 250, 150, 500, 300);
}

void declareClip(const HostCalls& host) {
  beginGroup(host, u"Clip");
  definePoint(host, u"Start", id::kClipStartPos, 0x1, -640.0f, -360.0f);
  definePoint(host, u"End", id::kClipEndPos, 0x1, 640.0f, 360.0f);
  endGroup(host);
}

void declareComparison(const HostCalls& host) {
  const int32_t hostVersion = host.call(&HostEffectRecord::hostVersion);
  beginGroup(host, u"Comparison");
  host.declare(&HostEffectRecord::defineLayer, overlayLayerLabel(hostVersion), id::kOverlayLayer,
               0x0);
  defineChoice(host, u"Render Mode", id::kScopeComparisonType, 0x0, kComparisonTypeChoices, 0);
  defineBool(host, u"Comparison Layer", id::kShowComparison, 0x2, true);
  defineChoice(host, u"Output Channels", id::kOverlayChannels, 0x2, kOverlayChannelChoices, 0);
  endGroup(host);
}

void declareOptions(const HostCalls& host) {
  beginGroup(host, u"Options");
  defineChoice(host, u"Analysis Downsample", id::kAnalysisDownsample, 0x100,
               kAnalysisDownsampleChoices, 0);
  defineBool(host, u"Use Default Color Space", id::kDefaultColorSpace, 0x62, true);
  defineChoice(host, u"Color Space", id::kColorSpace, 0x100, kColorSpaceChoices, 2);
  defineBool(host, u"Guidelines", id::kShowGuidelines, 0x2, true);
  defineBool(host, u"IRE Labels", id::kShowsAxisLabel, 0x2, true);
  defineBool(host, u"Standard Color Bars", id::kShowStandardColorBars, 0x100, true);
  endGroup(host);
}

void declareRenderToLayer(const HostCalls& host) {
  beginGroup(host, u"Render to Layer");
  defineChoice(host, u"Blend", id::kBlendType, 0x0, kBlendTypeChoices, 0);
  beginGroup(host, u"Position");
  definePoint(host, u"Top-Left", id::kScopePositionTL, 0x3, -640.0f, 360.0f);
  definePoint(host, u"Bottom-Right", id::kScopePositionBR, 0x3, 640.0f, -360.0f);
  endGroup(host);
  defineBool(host, u"Guidelines", id::kRenderToLayerShowGuidelines, 0x3, false);
  defineBool(host, u"Standard Color Bars", id::kRenderToLayerShowStandardColorBars, 0x3, false);
  defineBool(host, u"IRE Labels", id::kRenderToLayerShowsAxisLabel, 0x3, false);
  defineFloat(host, u"Label Scale", id::kRenderToLayerLabelScale, 0x2, 1.0f, 10.0f, 2.0f);
  host.declare(&HostEffectRecord::defineColor, u"Background Color",
               id::kRenderToLayerBackgroundColor, 0x3, kBackgroundGrey, kBackgroundGrey,
               kBackgroundGrey);
  defineFloat(host, u"Background Alpha", id::kRenderToLayerBackgroundAlpha, 0x3, 0.0f, 1.0f, 0.0f);
  endGroup(host);
}

}  // namespace

const char16_t* overlayLayerLabel(int32_t hostVersion) {
  switch (hostVersion) {
    case 5100:
    case 5200:
    case 5600:
    case 6001:
      return u"Compare To";
    default:
      return u"Layer";
  }
}

void declareParameters(const HostCalls& host) {
  declareControl(host);
  beginGroup(host, u"Controls");
  defineChoice(host, u"Mode", id::kWaveformMode, 0x100, kWaveformModeChoices, 0);
  host.declare(&HostEffectRecord::defineAngle, u"Direction", id::kWaveformDirection, 0x101,
               kAngleOption, 0.0f);
  host.declare(&HostEffectRecord::defineSlider, u"Brightness", kEmpty, id::kWaveformBrightness,
               0x101, 0.1f, 10.0f, 0.1f, 2.0f, 1.0f, int32_t{2});
  declareClip(host);
  declareComparison(host);
  declareOptions(host);
  declareRenderToLayer(host);
  endGroup(host);  // Controls
}

}  // namespace plugin::Scopes

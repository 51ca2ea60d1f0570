// The parameter panel as the host recorded the module's declarations.
#include <gtest/gtest.h>

#include <iterator>
#include <string>
#include <tuple>
#include <vector>

#include "utf16_text.h"
#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::host::ParameterDeclaration;
using Kind = vtpl::host::ParameterKind;
using Groups = std::vector<std::u16string>;

const Groups kTop = {};
const Groups kControls = {u"Controls"};
const Groups kClip = {u"Controls", u"Clip"};
const Groups kComparison = {u"Controls", u"Comparison"};
const Groups kOptions = {u"Controls", u"Options"};
const Groups kRender = {u"Controls", u"Render to Layer"};
const Groups kPosition = {u"Controls", u"Render to Layer", u"Position"};
constexpr double kGrey = 47.0f / 255.0f;  // defaults are the floats the host receives

struct ExpectedParameter {
  const char* id;
  Kind kind;
  const char16_t* label;
  Groups groups;
  uint32_t flags;
  std::array<double, 3> defaults;
};

const ExpectedParameter kExpectedPanel[] = {
    {"waveformControl", Kind::Control, u"", kTop, 0x60, {0}},
    {"waveformMode", Kind::Choice, u"Mode", kControls, 0x100, {0}},
    {"waveformDirection", Kind::Angle, u"Direction", kControls, 0x101, {0}},
    {"waveformBrightness", Kind::Slider, u"Brightness", kControls, 0x101, {1}},
    {"clipStartPos", Kind::Point, u"Start", kClip, 1, {-640, -360}},
    {"clipEndPos", Kind::Point, u"End", kClip, 1, {640, 360}},
    {"overlayLayer", Kind::Layer, u"Compare To", kComparison, 0, {0}},
    {"scopeComparisonType", Kind::Choice, u"Render Mode", kComparison, 0, {0}},
    {"showComparison", Kind::Bool, u"Comparison Layer", kComparison, 2, {1}},
    {"overlayChannels", Kind::Choice, u"Output Channels", kComparison, 2, {0}},
    {"analysisDownsample", Kind::Choice, u"Analysis Downsample", kOptions, 0x100, {0}},
    {"defaultColorSpace", Kind::Bool, u"Use Default Color Space", kOptions, 0x62, {1}},
    {"colorSpace", Kind::Choice, u"Color Space", kOptions, 0x100, {2}},
    {"showGuidelines", Kind::Bool, u"Guidelines", kOptions, 2, {1}},
    {"showsAxisLabel", Kind::Bool, u"IRE Labels", kOptions, 2, {1}},
    {"showStandardColorBars", Kind::Bool, u"Standard Color Bars", kOptions, 0x100, {1}},
    {"blendType", Kind::Choice, u"Blend", kRender, 0, {0}},
    {"scopePositionTL", Kind::Point, u"Top-Left", kPosition, 3, {-640, 360}},
    {"scopePositionBR", Kind::Point, u"Bottom-Right", kPosition, 3, {640, -360}},
    {"renderToLayerShowGuidelines", Kind::Bool, u"Guidelines", kRender, 3, {0}},
    {"renderToLayerShowStandardColorBars", Kind::Bool, u"Standard Color Bars", kRender, 3, {0}},
    {"renderToLayerShowsAxisLabel", Kind::Bool, u"IRE Labels", kRender, 3, {0}},
    {"renderToLayerLabelScale", Kind::Float, u"Label Scale", kRender, 2, {2}},
    {"renderToLayerBackgroundColor",
     Kind::Color,
     u"Background Color",
     kRender,
     3,
     {kGrey, kGrey, kGrey}},
    {"renderToLayerBackgroundAlpha", Kind::Float, u"Background Alpha", kRender, 3, {0}},
};

// Every id asked for is in the panel table, which the first test checks.
const ParameterDeclaration& declaration(vtpl::host::EffectHost& host, const char* id) {
  return host.parameters().find(id)->declaration;
}

TEST(Declarations, PanelMatchesTheParameterTableInOrder) {
  auto host = openHost();
  const std::vector<vtpl::host::Parameter>& declared = host->parameters().parameters();
  ASSERT_EQ(declared.size(), std::size(kExpectedPanel));
  for (size_t i = 0; i < declared.size(); ++i) {
    const ExpectedParameter& e = kExpectedPanel[i];
    const ParameterDeclaration& d = declared[i].declaration;
    EXPECT_EQ(std::tie(d.id, d.kind, d.label, d.groupPath, d.flags, d.defaults),
              std::make_tuple(e.id, e.kind, e.label, e.groups, e.flags, e.defaults))
        << i + 1 << " " << e.id;
    EXPECT_TRUE(d.unit.empty()) << e.id;
  }
  EXPECT_EQ(host->parameters().openGroupCount(), 0u);
  EXPECT_TRUE(host->unknownParameterIds().empty());
}

TEST(Declarations, RangesDecimalsAndTheCustomControl) {
  // Minimum, maximum, the slider's minimum and maximum.
  const std::pair<const char*, std::array<double, 4>> cases[] = {
      {"waveformBrightness", {0.1f, 10, 0.1f, 2}},
      {"renderToLayerLabelScale", {1, 10, 0, 0}},
      {"renderToLayerBackgroundAlpha", {0, 1, 0, 0}},
  };
  auto host = openHost();
  for (const auto& [id, range] : cases) {
    const ParameterDeclaration& d = declaration(*host, id);
    EXPECT_EQ((std::array<double, 4>{d.min, d.max, d.sliderMin, d.sliderMax}), range) << id;
    EXPECT_EQ(d.decimals, 2) << id;
  }
  EXPECT_EQ(declaration(*host, "waveformDirection").angleOption, 1);
  const ParameterDeclaration& control = declaration(*host, "waveformControl");
  EXPECT_EQ(control.aspect, 1.6666666269302368);
  EXPECT_EQ(control.controlSizes, (std::array<int32_t, 4>{250, 150, 500, 300}));
  EXPECT_TRUE(control.secondText.empty());
}

TEST(Declarations, ChoiceItemsAndValues) {
  const std::pair<const char*, const char*> cases[] = {
      {"waveformMode", "Luminance=0|RGB=1|CbCr=4|Red=5|Green=6|Blue=7|Alpha=8|"},
      {"scopeComparisonType", "Side by Side=0|Overlay=1|Single Scope=2|"},
      {"overlayChannels", "RG=0|RB=1|GR=2|GB=3|BR=4|BG=5|"},
      {"analysisDownsample", "Full=0|Half=1|Quarter=2|"},
      {"colorSpace", "Rec. 601=601|Rec. 709=709|Rec. 2020=2020|"},
      {"blendType",
       "None=0|Normal=1|Add=2|Color Burn=11|Color Dodge=5|Darken=10|Difference=13|Exclusion=14|"
       "Hardlight=8|Lighten=3|Multiply=9|Overlay=6|Screen=4|Softlight=7|Subtract=12|"},
  };
  auto host = openHost();
  for (const auto& [id, items] : cases) {
    std::string text;
    for (const vtpl::host::ChoiceEntry& entry : declaration(*host, id).choices) {
      text += vtpl::host::toUtf8(entry.text) + "=" + std::to_string(entry.value) + "|";
    }
    EXPECT_EQ(text, items) << id;
  }
}

TEST(Declarations, LayerLabelDependsOnHostVersion) {
  const std::pair<int32_t, const char16_t*> cases[] = {
      {5100, u"Compare To"}, {5200, u"Compare To"}, {5600, u"Compare To"}, {6001, u"Compare To"},
      {5300, u"Layer"},      {6000, u"Layer"},      {0, u"Layer"},         {-1, u"Layer"},
  };
  for (const auto& [version, label] : cases) {
    vtpl::host::HostSettings settings = declaredStateSettings();
    settings.version = version;
    EXPECT_EQ(declaration(*openHost(settings), "overlayLayer").label, label) << version;
  }
}

}  // namespace
}  // namespace waveform_test

// The parameter panel as the host recorded the module's declarations.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "utf16_text.h"
#include "waveform_module.h"

namespace waveform_test {
namespace {

using vtpl::host::ChoiceEntry;
using vtpl::host::Parameter;
using vtpl::host::ParameterKind;
using Groups = std::vector<std::u16string>;

struct ExpectedParameter {
  const char* id;
  ParameterKind kind;
  const char16_t* label;
  Groups groups;
  uint32_t flags;
  std::array<double, 3> defaults;
};

const Groups kTop = {};
const Groups kControls = {u"Controls"};
const Groups kClip = {u"Controls", u"Clip"};
const Groups kComparison = {u"Controls", u"Comparison"};
const Groups kOptions = {u"Controls", u"Options"};
const Groups kRenderToLayer = {u"Controls", u"Render to Layer"};
const Groups kPosition = {u"Controls", u"Render to Layer", u"Position"};

// Defaults are given as the floats the host receives.
const std::vector<ExpectedParameter> kExpectedPanel = {
    {"waveformControl", ParameterKind::Control, u"", kTop, 0x60, {0, 0, 0}},
    {"waveformMode", ParameterKind::Choice, u"Mode", kControls, 0x100, {0, 0, 0}},
    {"waveformDirection", ParameterKind::Angle, u"Direction", kControls, 0x101, {0, 0, 0}},
    {"waveformBrightness", ParameterKind::Slider, u"Brightness", kControls, 0x101, {1, 0, 0}},
    {"clipStartPos", ParameterKind::Point, u"Start", kClip, 1, {-640, -360, 0}},
    {"clipEndPos", ParameterKind::Point, u"End", kClip, 1, {640, 360, 0}},
    {"overlayLayer", ParameterKind::Layer, u"Compare To", kComparison, 0, {0, 0, 0}},
    {"scopeComparisonType", ParameterKind::Choice, u"Render Mode", kComparison, 0, {0, 0, 0}},
    {"showComparison", ParameterKind::Bool, u"Comparison Layer", kComparison, 2, {1, 0, 0}},
    {"overlayChannels", ParameterKind::Choice, u"Output Channels", kComparison, 2, {0, 0, 0}},
    {"analysisDownsample",
     ParameterKind::Choice,
     u"Analysis Downsample",
     kOptions,
     0x100,
     {0, 0, 0}},
    {"defaultColorSpace",
     ParameterKind::Bool,
     u"Use Default Color Space",
     kOptions,
     0x62,
     {1, 0, 0}},
    {"colorSpace", ParameterKind::Choice, u"Color Space", kOptions, 0x100, {2, 0, 0}},
    {"showGuidelines", ParameterKind::Bool, u"Guidelines", kOptions, 2, {1, 0, 0}},
    {"showsAxisLabel", ParameterKind::Bool, u"IRE Labels", kOptions, 2, {1, 0, 0}},
    {"showStandardColorBars",
     ParameterKind::Bool,
     u"Standard Color Bars",
     kOptions,
     0x100,
     {1, 0, 0}},
    {"blendType", ParameterKind::Choice, u"Blend", kRenderToLayer, 0, {0, 0, 0}},
    {"scopePositionTL", ParameterKind::Point, u"Top-Left", kPosition, 3, {-640, 360, 0}},
    {"scopePositionBR", ParameterKind::Point, u"Bottom-Right", kPosition, 3, {640, -360, 0}},
    {"renderToLayerShowGuidelines",
     ParameterKind::Bool,
     u"Guidelines",
     kRenderToLayer,
     3,
     {0, 0, 0}},
    {"renderToLayerShowStandardColorBars",
     ParameterKind::Bool,
     u"Standard Color Bars",
     kRenderToLayer,
     3,
     {0, 0, 0}},
    {"renderToLayerShowsAxisLabel",
     ParameterKind::Bool,
     u"IRE Labels",
     kRenderToLayer,
     3,
     {0, 0, 0}},
    {"renderToLayerLabelScale", ParameterKind::Float, u"Label Scale", kRenderToLayer, 2, {2, 0, 0}},
    {"renderToLayerBackgroundColor",
     ParameterKind::Color,
     u"Background Color",
     kRenderToLayer,
     3,
     {47.0f / 255.0f, 47.0f / 255.0f, 47.0f / 255.0f}},
    {"renderToLayerBackgroundAlpha",
     ParameterKind::Float,
     u"Background Alpha",
     kRenderToLayer,
     3,
     {0, 0, 0}},
};

const Parameter& parameter(vtpl::host::EffectHost& host, const char* id) {
  const Parameter* found = host.parameters().find(id);
  if (found == nullptr) {
    throw std::runtime_error(std::string("not declared: ") + id);
  }
  return *found;
}

std::vector<ChoiceEntry> choices(vtpl::host::EffectHost& host, const char* id) {
  return parameter(host, id).declaration.choices;
}

std::string describe(const std::vector<ChoiceEntry>& entries) {
  std::string text;
  for (const ChoiceEntry& entry : entries) {
    text += vtpl::host::toUtf8(entry.text) + "=" + std::to_string(entry.value) + "|";
  }
  return text;
}

TEST(Declarations, PanelMatchesTheParameterTableInOrder) {
  auto host = openHost();
  const std::vector<Parameter>& declared = host->parameters().parameters();
  ASSERT_EQ(declared.size(), kExpectedPanel.size());
  for (size_t i = 0; i < kExpectedPanel.size(); ++i) {
    const ExpectedParameter& expected = kExpectedPanel[i];
    const vtpl::host::ParameterDeclaration& actual = declared[i].declaration;
    SCOPED_TRACE(std::to_string(i + 1) + " " + expected.id);
    EXPECT_EQ(actual.id, expected.id);
    EXPECT_EQ(actual.kind, expected.kind);
    EXPECT_EQ(actual.label, expected.label);
    EXPECT_EQ(actual.groupPath, expected.groups);
    EXPECT_EQ(actual.flags, expected.flags);
    EXPECT_EQ(actual.defaults, expected.defaults);
    EXPECT_TRUE(actual.unit.empty());
  }
  EXPECT_EQ(host->parameters().openGroupCount(), 0u);
  EXPECT_TRUE(host->unknownParameterIds().empty());
}

TEST(Declarations, NumericRangesAndDecimals) {
  auto host = openHost();
  const auto& brightness = parameter(*host, "waveformBrightness").declaration;
  EXPECT_EQ(brightness.min, 0.1f);
  EXPECT_EQ(brightness.max, 10.0f);
  EXPECT_EQ(brightness.sliderMin, 0.1f);
  EXPECT_EQ(brightness.sliderMax, 2.0f);
  EXPECT_EQ(brightness.decimals, 2);

  const auto& labelScale = parameter(*host, "renderToLayerLabelScale").declaration;
  EXPECT_EQ(labelScale.min, 1.0f);
  EXPECT_EQ(labelScale.max, 10.0f);
  EXPECT_EQ(labelScale.decimals, 2);

  const auto& alpha = parameter(*host, "renderToLayerBackgroundAlpha").declaration;
  EXPECT_EQ(alpha.min, 0.0f);
  EXPECT_EQ(alpha.max, 1.0f);
  EXPECT_EQ(alpha.decimals, 2);

  EXPECT_EQ(parameter(*host, "waveformDirection").declaration.angleOption, 1);
}

TEST(Declarations, CustomControl) {
  auto host = openHost();
  const auto& control = parameter(*host, "waveformControl").declaration;
  EXPECT_EQ(control.aspect, 1.6666666269302368);
  EXPECT_EQ(control.controlSizes, (std::array<int32_t, 4>{250, 150, 500, 300}));
  EXPECT_TRUE(control.secondText.empty());
}

TEST(Declarations, ChoiceItemsAndValues) {
  struct Case {
    const char* id;
    const char* items;
  };
  const Case cases[] = {
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
  for (const Case& c : cases) {
    EXPECT_EQ(describe(choices(*host, c.id)), c.items) << c.id;
  }
}

TEST(Declarations, ChoiceReadsAnswerItemValuesNotPositions) {
  auto host = openHost();
  int32_t value = -1;
  ASSERT_TRUE(host->parameters().readInt("colorSpace", value));
  EXPECT_EQ(value, 2020);
  host->parameters().setFromText("blendType", "Color Burn");
  ASSERT_TRUE(host->parameters().readInt("blendType", value));
  EXPECT_EQ(value, 11);
}

TEST(Declarations, LayerLabelDependsOnHostVersion) {
  const std::pair<int32_t, const char16_t*> cases[] = {
      {5100, u"Compare To"}, {5200, u"Compare To"}, {5600, u"Compare To"}, {6001, u"Compare To"},
      {5300, u"Layer"},      {6000, u"Layer"},      {0, u"Layer"},         {-1, u"Layer"},
  };
  for (const auto& [version, label] : cases) {
    vtpl::host::HostSettings settings = declaredStateSettings();
    settings.version = version;
    auto host = openHost(settings);
    EXPECT_EQ(parameter(*host, "overlayLayer").declaration.label, label) << version;
  }
}

}  // namespace
}  // namespace waveform_test

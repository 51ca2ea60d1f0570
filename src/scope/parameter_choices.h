// The items of the effect's choice parameters, in display order, with the i32 value the host
// returns for each. Passes select their behaviour by value, never by position.
#ifndef WAVEFORM_SCOPE_PARAMETER_CHOICES_H
#define WAVEFORM_SCOPE_PARAMETER_CHOICES_H

#include <array>
#include <cstdint>

namespace plugin::Scopes {

struct ChoiceItem {
  const char16_t* text;
  int32_t value;
};

enum WaveformMode : int32_t {
  kModeLuminance = 0,
  kModeRGB = 1,
  kModeCbCr = 4,
  kModeRed = 5,
  kModeGreen = 6,
  kModeBlue = 7,
  kModeAlpha = 8,
};

enum ComparisonType : int32_t {
  kComparisonSideBySide = 0,
  kComparisonOverlay = 1,
  kComparisonSingleScope = 2,
};

enum OverlayChannels : int32_t {
  kOverlayRG = 0,
  kOverlayRB = 1,
  kOverlayGR = 2,
  kOverlayGB = 3,
  kOverlayBR = 4,
  kOverlayBG = 5,
};

enum AnalysisDownsample : int32_t {
  kDownsampleFull = 0,
  kDownsampleHalf = 1,
  kDownsampleQuarter = 2,
};

enum ColorSpace : int32_t {
  kRec601 = 601,
  kRec709 = 709,
  kRec2020 = 2020,
};

enum BlendType : int32_t {
  kBlendNone = 0,
  kBlendNormal = 1,
  kBlendAdd = 2,
  kBlendLighten = 3,
  kBlendScreen = 4,
  kBlendColorDodge = 5,
  kBlendOverlay = 6,
  kBlendSoftlight = 7,
  kBlendHardlight = 8,
  kBlendMultiply = 9,
  kBlendDarken = 10,
  kBlendColorBurn = 11,
  kBlendSubtract = 12,
  kBlendDifference = 13,
  kBlendExclusion = 14,
};

inline constexpr std::array<ChoiceItem, 7> kWaveformModeChoices{{
    {u"Luminance", kModeLuminance},
    {u"RGB", kModeRGB},
    {u"CbCr", kModeCbCr},
    {u"Red", kModeRed},
    {u"Green", kModeGreen},
    {u"Blue", kModeBlue},
    {u"Alpha", kModeAlpha},
}};

inline constexpr std::array<ChoiceItem, 3> kComparisonTypeChoices{{
    {u"Side by Side", kComparisonSideBySide},
    {u"Overlay", kComparisonOverlay},
    {u"Single Scope", kComparisonSingleScope},
}};

inline constexpr std::array<ChoiceItem, 6> kOverlayChannelChoices{{
    {u"RG", kOverlayRG},
    {u"RB", kOverlayRB},
    {u"GR", kOverlayGR},
    {u"GB", kOverlayGB},
    {u"BR", kOverlayBR},
    {u"BG", kOverlayBG},
}};

inline constexpr std::array<ChoiceItem, 3> kAnalysisDownsampleChoices{{
    {u"Full", kDownsampleFull},
    {u"Half", kDownsampleHalf},
    {u"Quarter", kDownsampleQuarter},
}};

inline constexpr std::array<ChoiceItem, 3> kColorSpaceChoices{{
    {u"Rec. 601", kRec601},
    {u"Rec. 709", kRec709},
    {u"Rec. 2020", kRec2020},
}};

// Display order is alphabetical after "None" and "Normal"; the values follow the blend pass.
inline constexpr std::array<ChoiceItem, 15> kBlendTypeChoices{{
    {u"None", kBlendNone},
    {u"Normal", kBlendNormal},
    {u"Add", kBlendAdd},
    {u"Color Burn", kBlendColorBurn},
    {u"Color Dodge", kBlendColorDodge},
    {u"Darken", kBlendDarken},
    {u"Difference", kBlendDifference},
    {u"Exclusion", kBlendExclusion},
    {u"Hardlight", kBlendHardlight},
    {u"Lighten", kBlendLighten},
    {u"Multiply", kBlendMultiply},
    {u"Overlay", kBlendOverlay},
    {u"Screen", kBlendScreen},
    {u"Softlight", kBlendSoftlight},
    {u"Subtract", kBlendSubtract},
}};

}  // namespace plugin::Scopes

#endif  // WAVEFORM_SCOPE_PARAMETER_CHOICES_H

// Small text rules of the entry points (bounded copies, choice lists, colour space by height) and
// the plug-in's UTF-8 <-> UTF-16 conversions, on the cases the host's converter meets too.
#include <gtest/gtest.h>

#include <array>
#include <string>
#include <vector>

#include "platform/utf16_text.h"
#include "plugin/parameter_declarations.h"
#include "plugin/parameter_reactions.h"
#include "plugin/plugin_info.h"
#include "scope/parameter_choices.h"
#include "utf8_decoding_cases.h"

namespace {

using namespace plugin::Scopes;

TEST(CopyBounded, TerminatesOnlyWhenThereIsRoomWithinTheBound) {
  struct Case {
    const char16_t* source;
    size_t bound;
    std::u16string expected;  // the first bound + 1 characters of the buffer afterwards
  };
  const Case cases[] = {
      {u"abc", 5, std::u16string(u"abc\0**", 6)},
      {u"abc", 4, std::u16string(u"abc\0*", 5)},
      {u"abc", 3, u"abc*"},  // fills the bound: no terminator
      {u"abcdef", 3, u"abc*"},
      {u"", 2, std::u16string(u"\0**", 3)},
      {u"abc", 0, u"*"},
  };
  for (const Case& c : cases) {
    std::u16string buffer(8, u'*');
    copyBounded(buffer.data(), c.source, c.bound);
    EXPECT_EQ(buffer.substr(0, c.bound + 1), c.expected) << "bound " << c.bound;
  }
}

TEST(CopyBounded, NarrowCopyAndNullTarget) {
  std::string buffer(6, '*');
  copyBounded(buffer.data(), "bundle", 4);
  EXPECT_EQ(buffer, "bund**");
  copyBounded(static_cast<char*>(nullptr), "bundle", 4);
  copyBounded(static_cast<char16_t*>(nullptr), u"name", 4);
}

TEST(JoinChoiceTexts, BarsOnlyBetweenItems) {
  EXPECT_EQ(joinChoiceTexts(std::vector<ChoiceItem>{}), u"");
  EXPECT_EQ(joinChoiceTexts(std::vector<ChoiceItem>{{u"One", 1}}), u"One");
  EXPECT_EQ(joinChoiceTexts(std::vector<ChoiceItem>{{u"", 0}, {u"B", 1}}), u"|B");
  EXPECT_EQ(joinChoiceTexts(kComparisonTypeChoices), u"Side by Side|Overlay|Single Scope");
}

TEST(ColorSpaceForLayerHeight, BoundariesAt576And1080) {
  const std::array<std::pair<int32_t, int32_t>, 9> cases{{
      {-1, 601},
      {0, 601},
      {480, 601},
      {576, 601},
      {577, 709},
      {720, 709},
      {1080, 709},
      {1081, 2020},
      {4320, 2020},
  }};
  for (const auto& [height, space] : cases) {
    EXPECT_EQ(colorSpaceForLayerHeight(height), space) << height;
  }
}

TEST(BlendChoices, EveryBlendValueAppearsOnce) {
  std::vector<bool> seen(15, false);
  for (const ChoiceItem& item : kBlendTypeChoices) {
    ASSERT_GE(item.value, 0);
    ASSERT_LT(item.value, 15);
    EXPECT_FALSE(seen[item.value]) << item.value;
    seen[item.value] = true;
  }
}

TEST(Utf16Text, DecodesUtf8AsTheHostDoes) {
  for (const test_support::Utf8DecodingCase& c : test_support::kUtf8DecodingCases) {
    const std::string utf8(c.utf8);
    EXPECT_EQ(platform::toUtf16(utf8), std::u16string(c.utf16)) << testing::PrintToString(utf8);
  }
}

TEST(Utf16Text, EncodesUtf16AsTheHostDoes) {
  for (const test_support::Utf16EncodingCase& c : test_support::kUtf16EncodingCases) {
    const std::u16string utf16(c.utf16);
    EXPECT_EQ(platform::toUtf8(utf16), std::string(c.utf8)) << testing::PrintToString(utf16);
  }
}

}  // namespace

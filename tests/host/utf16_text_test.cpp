// The host's UTF-8 <-> UTF-16 conversions, on the cases the plug-in's converter meets too.
#include "utf16_text.h"

#include <gtest/gtest.h>

#include "utf8_decoding_cases.h"

namespace vtpl::host {
namespace {

TEST(Utf16Text, DecodesUtf8AsThePluginDoes) {
  for (const test_support::Utf8DecodingCase& c : test_support::kUtf8DecodingCases) {
    EXPECT_EQ(toUtf16(c.utf8), std::u16string(c.utf16))
        << testing::PrintToString(std::string(c.utf8));
  }
}

TEST(Utf16Text, EncodesUtf16AsThePluginDoes) {
  for (const test_support::Utf16EncodingCase& c : test_support::kUtf16EncodingCases) {
    EXPECT_EQ(toUtf8(c.utf16), std::string(c.utf8))
        << testing::PrintToString(std::u16string(c.utf16));
  }
}

}  // namespace
}  // namespace vtpl::host

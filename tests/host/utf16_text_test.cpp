// UTF-16 to UTF-8 and back, including surrogate pairs and malformed input.
#include "utf16_text.h"

#include <gtest/gtest.h>

namespace vtpl::host {
namespace {

TEST(Utf16Text, RoundTripsEveryPlane) {
  const std::u16string samples[] = {u"",
                                    u"Waveform",
                                    u"\u00A9 Quorvel",
                                    u"\u0627\u0644\u0639",
                                    u"\U0001F3A5 clip",
                                    u"\uFFFD\uFFFF"};
  for (const std::u16string& sample : samples) {
    EXPECT_EQ(toUtf16(toUtf8(sample)), sample);
  }
  EXPECT_EQ(toUtf8(u"\u00A9"), "\xC2\xA9");
  EXPECT_EQ(toUtf8(u"\U0001F3A5"), "\xF0\x9F\x8E\xA5");
}

TEST(Utf16Text, MalformedInputBecomesReplacementCharacters) {
  EXPECT_EQ(toUtf8(std::u16string(1, char16_t(0xD800))), "\xEF\xBF\xBD");
  EXPECT_EQ(toUtf8(std::u16string{char16_t(0xDC00), u'a'}),
            "\xEF\xBF\xBD"
            "a");
  EXPECT_EQ(toUtf16("\xC3"), u"\uFFFD");          // truncated sequence
  EXPECT_EQ(toUtf16("\xC0\x80"), u"\uFFFD");      // overlong form
  EXPECT_EQ(toUtf16("\xED\xA0\x80"), u"\uFFFD");  // encoded surrogate
  EXPECT_EQ(toUtf16("\xFF"
                    "a"),
            u"\uFFFDa");
}

}  // namespace
}  // namespace vtpl::host

// Conversion cases that the host's and the plug-in's UTF-8 <-> UTF-16 converters must both meet,
// so that the two sides never disagree on a text. Malformed UTF-8 becomes one U+FFFD per maximal
// subpart: a byte that starts no well-formed sequence, or the longest well-formed beginning of a
// sequence that is cut short; the byte that cuts it short starts anew. An unpaired surrogate in
// UTF-16 becomes U+FFFD.
#ifndef WAVEFORM_TESTS_SUPPORT_UTF8_DECODING_CASES_H
#define WAVEFORM_TESTS_SUPPORT_UTF8_DECODING_CASES_H

#include <string_view>

namespace test_support {

struct Utf8DecodingCase {
  std::string_view utf8;
  std::u16string_view utf16;
};

// The letter after a hex escape is z, which is no hex digit: a to f would join the escape.
inline constexpr Utf8DecodingCase kUtf8DecodingCases[] = {
    {"", u""},
    {"Az~", u"Az~"},                                    // 1 byte
    {"\xC2\xA9", u"\u00A9"},                            // 2 bytes
    {"\xE2\x82\xAC", u"\u20AC"},                        // 3 bytes
    {"\xDF\xBF\xE0\xA0\x80", u"\u07FF\u0800"},          // the last 2-byte, the first 3-byte
    {"\xF0\x9F\x8E\xA5", u"\U0001F3A5"},                // 4 bytes, a surrogate pair in UTF-16
    {"\xF4\x8F\xBF\xBF", u"\U0010FFFF"},                // the last code point
    {"\xC0\x80", u"\uFFFD\uFFFD"},                      // overlong: C0 starts no sequence
    {"\xE0\x80\x80", u"\uFFFD\uFFFD\uFFFD"},            // overlong 3-byte form
    {"\xF0\x80\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},  // overlong 4-byte form
    {"\xED\xA0\x80", u"\uFFFD\uFFFD\uFFFD"},            // the surrogate U+D800
    {"\xF4\x90\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"},  // U+110000, past the last code point
    {"\xF5\x80", u"\uFFFD\uFFFD"},                      // a lead byte past F4
    {"\xFFz", u"\uFFFDz"},                              // a byte UTF-8 never uses
    {"z\x80\xBFz", u"z\uFFFD\uFFFDz"},                  // lone continuation bytes
    {"\xC3", u"\uFFFD"},                                // cut short at the end
    {"\xF0\x9F\x8E", u"\uFFFD"},                        // cut short at the end
    {"\xE2\x82z", u"\uFFFDz"},                          // cut short by ASCII
    {"\xF0\x9F\xC2\xA9", u"\uFFFD\u00A9"},              // cut short by a new lead
    {"\xE1\x80\xE2\x82\xAC", u"\uFFFD\u20AC"},          // cut short by a new lead
};

struct Utf16EncodingCase {
  std::u16string_view utf16;
  std::string_view utf8;
};

inline constexpr Utf16EncodingCase kUtf16EncodingCases[] = {
    {u"", ""},
    {u"z\u00A9\u20AC", "z\xC2\xA9\xE2\x82\xAC"},
    {u"\U0001F3A5", "\xF0\x9F\x8E\xA5"},                      // a surrogate pair
    {u"\u07FF\u0800", "\xDF\xBF\xE0\xA0\x80"},                // the last 2-byte, the first 3-byte
    {u"\U0010FFFF", "\xF4\x8F\xBF\xBF"},                      // a pair ending in DFFF
    {u"\xD800", "\xEF\xBF\xBD"},                              // a high surrogate at the end
    {u"\xD800z", "\xEF\xBF\xBDz"},                            // a high surrogate before no low one
    {u"\xDC00z", "\xEF\xBF\xBDz"},                            // a low surrogate first
    {u"\xDC00\xD800", "\xEF\xBF\xBD\xEF\xBF\xBD"},            // a pair in the wrong order
    {u"\xD800\xD800\xDC00", "\xEF\xBF\xBD\xF0\x90\x80\x80"},  // the second high one pairs
};

}  // namespace test_support

#endif  // WAVEFORM_TESTS_SUPPORT_UTF8_DECODING_CASES_H

// UTF-8 <-> UTF-16 conversion: fontconfig, the environment, the file system and font files speak
// UTF-8 or UTF-16, the services and the font catalogue answer in UTF-16.
#ifndef WAVEFORM_PLATFORM_UTF16_TEXT_H
#define WAVEFORM_PLATFORM_UTF16_TEXT_H

#include <optional>
#include <string>

namespace platform {

// Each malformed sequence becomes one U+FFFD: a byte that starts no sequence, or the longest
// well-formed beginning of a sequence that is cut short (the byte that breaks it starts anew).
std::u16string toUtf16(const std::string& utf8);
// An unpaired surrogate becomes U+FFFD.
std::string toUtf8(const std::u16string& utf16);
// Nothing when the text holds an unpaired surrogate.
std::optional<std::string> toUtf8Strict(const std::u16string& utf16);

}  // namespace platform

#endif  // WAVEFORM_PLATFORM_UTF16_TEXT_H

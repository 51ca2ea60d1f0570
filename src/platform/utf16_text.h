// UTF-8 <-> UTF-16 conversion for the platform layer only: fontconfig, the environment and the
// file system speak UTF-8, the services answer in UTF-16.
#ifndef WAVEFORM_PLATFORM_UTF16_TEXT_H
#define WAVEFORM_PLATFORM_UTF16_TEXT_H

#include <string>

namespace platform {

// Malformed UTF-8 (a stray continuation byte, a truncated or overlong sequence, an encoded
// surrogate, a value above U+10FFFF) becomes one U+FFFD per offending byte.
std::u16string toUtf16(const std::string& utf8);
// An unpaired surrogate becomes U+FFFD.
std::string toUtf8(const std::u16string& utf16);

}  // namespace platform

#endif  // WAVEFORM_PLATFORM_UTF16_TEXT_H

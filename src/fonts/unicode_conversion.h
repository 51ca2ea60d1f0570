// Conversions between the UTF-16 and UTF-8 forms of names read from font files and paths.
#ifndef WAVEFORM_FONTS_UNICODE_CONVERSION_H
#define WAVEFORM_FONTS_UNICODE_CONVERSION_H

#include <optional>
#include <string>

namespace vesk::project {

// UTF-16 to UTF-8, or nothing when the text holds an unpaired surrogate.
std::optional<std::string> utf16ToUtf8(const std::u16string& text);

}  // namespace vesk::project

#endif  // WAVEFORM_FONTS_UNICODE_CONVERSION_H

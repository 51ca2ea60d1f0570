// Conversions between the UTF-16 strings of the host interface and UTF-8 for printing.
#ifndef VTPL_HOST_UTF16_TEXT_H
#define VTPL_HOST_UTF16_TEXT_H

#include <string>
#include <string_view>

namespace vtpl::host {

// Unpaired surrogates become U+FFFD.
std::string toUtf8(std::u16string_view text);
// Malformed sequences become U+FFFD.
std::u16string toUtf16(std::string_view text);

}  // namespace vtpl::host

#endif  // VTPL_HOST_UTF16_TEXT_H

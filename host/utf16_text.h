// Conversions between the UTF-16 strings of the host interface and UTF-8 for printing.
#ifndef VTPL_HOST_UTF16_TEXT_H
#define VTPL_HOST_UTF16_TEXT_H

#include <string>
#include <string_view>

namespace vtpl::host {

// Unpaired surrogates become U+FFFD.
std::string toUtf8(std::u16string_view text);
// Each maximal subpart of a malformed sequence becomes one U+FFFD: a byte that starts no
// sequence, or the longest well-formed beginning of a sequence that is cut short (the byte that
// cuts it short starts anew), as the plug-in's own converter does.
std::u16string toUtf16(std::string_view text);

}  // namespace vtpl::host

#endif  // VTPL_HOST_UTF16_TEXT_H

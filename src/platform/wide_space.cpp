// The platform's wide-character white space test, kept apart from the services object so that
// the text code can ask it without loading the font configuration.
#include "platform/system_services.h"

namespace platform {

// The white space of glibc's wide-character classification in a UTF-8 locale: the C0 spaces
// U+0009..U+000D and U+0020, and Unicode's space separators and line and paragraph separators,
// except the no-break spaces U+00A0, U+2007 and U+202F. The next line, U+0085, is a control
// character to glibc, not a space. A fixed set, so that the answer does not depend on the
// process's locale.
bool isWideSpace(char32_t c) {
  return (c >= 0x0009 && c <= 0x000D) || c == 0x0020 || c == 0x1680 ||
         (c >= 0x2000 && c <= 0x2006) || (c >= 0x2008 && c <= 0x200A) || c == 0x2028 ||
         c == 0x2029 || c == 0x205F || c == 0x3000;
}

}  // namespace platform

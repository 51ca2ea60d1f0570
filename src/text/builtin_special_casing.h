// The multi-character case mappings the text engine knows without any data file.
#ifndef WAVEFORM_TEXT_BUILTIN_SPECIAL_CASING_H
#define WAVEFORM_TEXT_BUILTIN_SPECIAL_CASING_H

#include <cstdint>
#include <map>

#include "text/unicode_helper.h"

namespace vesk::plugin::lib {

// The unconditional mappings of Unicode's special casing (102 code points; U+0130, whose
// lower-case mapping depends on the language, and the conditional mappings are left out).
const std::map<uint32_t, SpecialCasingRecord>& builtInSpecialCasing();

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_TEXT_BUILTIN_SPECIAL_CASING_H

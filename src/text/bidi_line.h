// What the bidi engine leaves to the line: the rest of rule L1 at the end of a line, and the
// visual order of rule L2.
#ifndef WAVEFORM_TEXT_BIDI_LINE_H
#define WAVEFORM_TEXT_BIDI_LINE_H

#include <cstdint>
#include <vector>

#include "text/unicode_helper.h"

namespace vesk::plugin::lib {

// L1 for one line of resolved levels: white space and isolate formatting characters (by their
// original classes) before a segment or paragraph separator or at the end of the line take the
// paragraph level, and so do the separators. Removed characters (level kRemovedBidiLevel) are
// passed over and keep their level.
void resetLineEndLevels(const std::vector<BidiClass>& classes, std::vector<int16_t>& levels,
                        int paragraphLevel);

// L2: the indices of the line's characters from left to right; removed characters are left out.
std::vector<int> visualOrder(const std::vector<int16_t>& levels);

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_TEXT_BIDI_LINE_H

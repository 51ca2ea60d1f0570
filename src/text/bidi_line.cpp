#include "text/bidi_line.h"

#include <algorithm>

#include "text/bidi_paragraph.h"

namespace vesk::plugin::lib {

void resetLineEndLevels(const std::vector<BidiClass>& classes, std::vector<int16_t>& levels,
                        int paragraphLevel) {
  bool trailing = true;
  for (size_t i = std::min(classes.size(), levels.size()); i-- > 0;) {
    const BidiClass c = classes[i];
    if (levels[i] == kRemovedBidiLevel) {
      continue;
    }
    if (c == BidiClass::S || c == BidiClass::B) {
      levels[i] = static_cast<int16_t>(paragraphLevel);
      trailing = true;
    } else if (trailing && (c == BidiClass::WS || c == BidiClass::LRI || c == BidiClass::RLI ||
                            c == BidiClass::FSI || c == BidiClass::PDI)) {
      levels[i] = static_cast<int16_t>(paragraphLevel);
    } else {
      trailing = false;
    }
  }
}

std::vector<int> visualOrder(const std::vector<int16_t>& levels) {
  std::vector<int> order;
  int16_t highest = 0;
  int16_t lowestOdd = kMaxBidiDepth + 2;
  for (size_t i = 0; i < levels.size(); ++i) {
    if (levels[i] != kRemovedBidiLevel) {
      order.push_back(static_cast<int>(i));
      highest = std::max(highest, levels[i]);
      lowestOdd = levels[i] % 2 == 1 ? std::min(lowestOdd, levels[i]) : lowestOdd;
    }
  }
  for (int16_t level = highest; level >= lowestOdd; --level) {
    for (size_t i = 0; i < order.size();) {
      if (levels[order[i]] < level) {
        ++i;
        continue;
      }
      size_t end = i;
      while (end < order.size() && levels[order[end]] >= level) {
        ++end;
      }
      std::reverse(order.begin() + i, order.begin() + end);
      i = end;
    }
  }
  return order;
}

}  // namespace vesk::plugin::lib

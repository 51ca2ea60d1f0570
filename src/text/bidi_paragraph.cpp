#include "text/bidi_paragraph.h"

#include <algorithm>
#include <array>
#include <utility>
#include <vector>

namespace vesk::plugin::lib {
namespace {

using C = BidiClass;

bool isIsolateInitiator(C c) {
  return c == C::LRI || c == C::RLI || c == C::FSI;
}

bool isRemovedByX9(C c) {
  return c == C::RLE || c == C::LRE || c == C::RLO || c == C::LRO || c == C::PDF || c == C::BN;
}

// The neutral and isolate formatting classes that N1 and N2 resolve.
bool isNeutral(C c) {
  return c == C::B || c == C::S || c == C::WS || c == C::ON || isIsolateInitiator(c) || c == C::PDI;
}

// The direction a resolved class gives its neighbours in N0 and N1: numbers count as R.
C strongDirection(C c) {
  if (c == C::L) {
    return C::L;
  }
  return c == C::R || c == C::AL || c == C::EN || c == C::AN ? C::R : C::ON;
}

C directionOfLevel(int level) {
  return level % 2 == 0 ? C::L : C::R;
}

// One entry of the directional status stack of X1-X8.
struct DirectionalStatus {
  int16_t level = 0;
  C override = C::ON;  // ON: neutral, else L or R
  bool isolate = false;
};

struct LevelRun {
  size_t begin = 0;  // positions in the list of characters X9 keeps
  size_t end = 0;
};

// One paragraph: explicit levels, then each isolating run sequence on its own, then I1/I2.
class ParagraphResolver {
 public:
  ParagraphResolver(const C* classes, const uint32_t* codePoints, size_t count,
                    BracketSource* brackets, C* types, int16_t* levels)
      : original_(classes),
        codePoints_(codePoints),
        count_(count),
        brackets_(brackets),
        types_(types),
        levels_(levels) {}

  int resolve(int32_t direction) {
    matchIsolates();
    if (direction != 0) {
      paragraphLevel_ = direction > 0 ? 0 : 1;
    } else {
      const C first = firstStrongClass(original_, count_);
      paragraphLevel_ = first == C::R || first == C::AL ? 1 : 0;
    }
    explicitLevels();
    keepAfterX9();
    for (const std::vector<size_t>& runs : isolatingRunSequences()) {
      resolveSequence(runs);
    }
    implicitLevels();
    return paragraphLevel_;
  }

 private:
  // BD9: the PDI matching each isolate initiator.
  void matchIsolates() {
    matchingPdi_.assign(count_, -1);
    std::vector<int32_t> open;
    for (size_t i = 0; i < count_; ++i) {
      if (isIsolateInitiator(original_[i])) {
        open.push_back(static_cast<int32_t>(i));
      } else if (original_[i] == C::PDI && !open.empty()) {
        matchingPdi_[open.back()] = static_cast<int32_t>(i);
        open.pop_back();
      }
    }
  }

  // X1-X8.
  void explicitLevels() {
    std::array<DirectionalStatus, kMaxBidiDepth + 2> stack;
    size_t depth = 0;
    stack[depth++] = {static_cast<int16_t>(paragraphLevel_), C::ON, false};
    int overflowIsolates = 0;
    int overflowEmbeddings = 0;
    int validIsolates = 0;
    auto nextLevel = [&](bool odd) {
      const int level = stack[depth - 1].level;
      return static_cast<int16_t>(odd ? (level + 1) | 1 : (level + 2) & ~1);
    };
    // The current level, and the class an override gives the character.
    auto takeCurrent = [&](size_t i) {
      levels_[i] = stack[depth - 1].level;
      if (stack[depth - 1].override != C::ON) {
        types_[i] = stack[depth - 1].override;
      }
    };
    for (size_t i = 0; i < count_; ++i) {
      C c = original_[i];
      types_[i] = c;
      switch (c) {
        case C::RLE:
        case C::LRE:
        case C::RLO:
        case C::LRO: {
          levels_[i] = stack[depth - 1].level;
          const int16_t level = nextLevel(c == C::RLE || c == C::RLO);
          if (level <= kMaxBidiDepth && overflowIsolates == 0 && overflowEmbeddings == 0) {
            const C override = c == C::LRO ? C::L : c == C::RLO ? C::R : C::ON;
            stack[depth++] = {level, override, false};
          } else if (overflowIsolates == 0) {
            ++overflowEmbeddings;
          }
          break;
        }
        case C::FSI:
        case C::RLI:
        case C::LRI: {
          if (c == C::FSI) {
            const size_t end = matchingPdi_[i] >= 0 ? matchingPdi_[i] : count_;
            const C first = firstStrongClass(original_ + i + 1, end - i - 1);
            c = first == C::R || first == C::AL ? C::RLI : C::LRI;
            types_[i] = c;
          }
          takeCurrent(i);
          const int16_t level = nextLevel(c == C::RLI);
          if (level <= kMaxBidiDepth && overflowIsolates == 0 && overflowEmbeddings == 0) {
            ++validIsolates;
            stack[depth++] = {level, C::ON, true};
          } else {
            ++overflowIsolates;
          }
          break;
        }
        case C::PDI:
          if (overflowIsolates > 0) {
            --overflowIsolates;
          } else if (validIsolates > 0) {
            overflowEmbeddings = 0;
            while (!stack[depth - 1].isolate) {
              --depth;
            }
            --depth;
            --validIsolates;
          }
          takeCurrent(i);
          break;
        case C::PDF:
          levels_[i] = stack[depth - 1].level;
          if (overflowIsolates > 0) {
          } else if (overflowEmbeddings > 0) {
            --overflowEmbeddings;
          } else if (!stack[depth - 1].isolate && depth >= 2) {
            --depth;
          }
          break;
        case C::B:
          levels_[i] = static_cast<int16_t>(paragraphLevel_);
          break;
        case C::BN:
          levels_[i] = stack[depth - 1].level;
          break;
        default:
          takeCurrent(i);
          break;
      }
    }
  }

  // X9: the characters that stay, in order.
  void keepAfterX9() {
    kept_.clear();
    for (size_t i = 0; i < count_; ++i) {
      if (isRemovedByX9(original_[i])) {
        levels_[i] = kRemovedBidiLevel;
      } else {
        kept_.push_back(i);
      }
    }
  }

  // X10 with BD13: the level runs of the kept characters, chained through matching isolates;
  // each sequence as the list of its runs.
  std::vector<std::vector<size_t>> isolatingRunSequences() {
    runs_.clear();
    for (size_t k = 0; k < kept_.size(); ++k) {
      if (k == 0 || levels_[kept_[k]] != levels_[kept_[k - 1]]) {
        runs_.push_back({k, k + 1});
      } else {
        runs_.back().end = k + 1;
      }
    }
    std::vector<int32_t> runStartingAt(count_, -1);
    for (size_t r = 0; r < runs_.size(); ++r) {
      runStartingAt[kept_[runs_[r].begin]] = static_cast<int32_t>(r);
    }
    std::vector<int32_t> nextRun(runs_.size(), -1);
    std::vector<bool> continues(runs_.size(), false);
    for (size_t r = 0; r < runs_.size(); ++r) {
      const size_t last = kept_[runs_[r].end - 1];
      if (isIsolateInitiator(original_[last]) && matchingPdi_[last] >= 0) {
        const int32_t next = runStartingAt[matchingPdi_[last]];
        if (next >= 0) {
          nextRun[r] = next;
          continues[next] = true;
        }
      }
    }
    std::vector<std::vector<size_t>> sequences;
    for (size_t r = 0; r < runs_.size(); ++r) {
      if (continues[r]) {
        continue;
      }
      sequences.emplace_back();
      for (int32_t run = static_cast<int32_t>(r); run >= 0; run = nextRun[run]) {
        sequences.back().push_back(run);
      }
    }
    return sequences;
  }

  void resolveSequence(const std::vector<size_t>& runs) {
    sequence_.clear();
    for (size_t r : runs) {
      for (size_t k = runs_[r].begin; k < runs_[r].end; ++k) {
        sequence_.push_back(kept_[k]);
      }
    }
    const int level = levels_[sequence_.front()];
    const size_t firstKept = runs_[runs.front()].begin;
    const size_t lastKept = runs_[runs.back()].end - 1;
    const int before = firstKept > 0 ? levels_[kept_[firstKept - 1]] : paragraphLevel_;
    const bool endsOpen = isIsolateInitiator(original_[sequence_.back()]);
    const int after =
        lastKept + 1 < kept_.size() && !endsOpen ? levels_[kept_[lastKept + 1]] : paragraphLevel_;
    sos_ = directionOfLevel(std::max(level, before));
    eos_ = directionOfLevel(std::max(level, after));
    embedding_ = directionOfLevel(level);
    t_.resize(sequence_.size());
    for (size_t i = 0; i < sequence_.size(); ++i) {
      t_[i] = types_[sequence_[i]];
    }
    weakTypes();
    if (codePoints_ != nullptr && brackets_ != nullptr) {
      bracketPairs();
    }
    neutralTypes();
    for (size_t i = 0; i < sequence_.size(); ++i) {
      types_[sequence_[i]] = t_[i];
    }
  }

  // W1-W7.
  void weakTypes() {
    const size_t n = t_.size();
    for (size_t i = 0; i < n; ++i) {  // W1
      if (t_[i] == C::NSM) {
        t_[i] = i == 0                                                 ? sos_
                : isIsolateInitiator(t_[i - 1]) || t_[i - 1] == C::PDI ? C::ON
                                                                       : t_[i - 1];
      }
    }
    C lastStrong = sos_;
    for (size_t i = 0; i < n; ++i) {  // W2, W3
      if (t_[i] == C::L || t_[i] == C::R || t_[i] == C::AL) {
        lastStrong = t_[i];
      } else if (t_[i] == C::EN && lastStrong == C::AL) {
        t_[i] = C::AN;
      }
    }
    for (size_t i = 0; i < n; ++i) {
      if (t_[i] == C::AL) {
        t_[i] = C::R;
      }
    }
    for (size_t i = 1; i + 1 < n; ++i) {  // W4
      if (t_[i] == C::ES && t_[i - 1] == C::EN && t_[i + 1] == C::EN) {
        t_[i] = C::EN;
      } else if (t_[i] == C::CS && t_[i - 1] == t_[i + 1] &&
                 (t_[i - 1] == C::EN || t_[i - 1] == C::AN)) {
        t_[i] = t_[i - 1];
      }
    }
    for (size_t i = 0; i < n;) {  // W5
      if (t_[i] != C::ET) {
        ++i;
        continue;
      }
      size_t end = i;
      while (end < n && t_[end] == C::ET) {
        ++end;
      }
      if ((i > 0 && t_[i - 1] == C::EN) || (end < n && t_[end] == C::EN)) {
        std::fill(t_.begin() + i, t_.begin() + end, C::EN);
      }
      i = end;
    }
    for (C& c : t_) {  // W6
      if (c == C::ES || c == C::ET || c == C::CS) {
        c = C::ON;
      }
    }
    lastStrong = sos_;
    for (C& c : t_) {  // W7
      if (c == C::L || c == C::R) {
        lastStrong = c;
      } else if (c == C::EN && lastStrong == C::L) {
        c = C::L;
      }
    }
  }

  // BD16: the bracket pairs of the sequence, by opening position. At most 63 openers wait;
  // a 64th ends the search for this sequence (the pairs found so far stay).
  std::vector<std::pair<size_t, size_t>> findBracketPairs() {
    constexpr size_t kMaxOpeners = 63;
    struct Opener {
      uint32_t closing;  // canonical form of the bracket that closes it
      size_t position;
    };
    std::vector<Opener> openers;
    std::vector<std::pair<size_t, size_t>> pairs;
    for (size_t i = 0; i < t_.size(); ++i) {
      if (t_[i] != C::ON) {
        continue;
      }
      const uint32_t codePoint = codePoints_[sequence_[i]];
      const BracketRecord record = brackets_->bracket(codePoint);
      if (record.type == BracketType::kOpening) {
        if (openers.size() == kMaxOpeners) {
          break;
        }
        openers.push_back({brackets_->canonical(record.pair), i});
      } else if (record.type == BracketType::kClosing && !openers.empty()) {
        const uint32_t closing = brackets_->canonical(codePoint);
        for (size_t k = openers.size(); k-- > 0;) {
          if (openers[k].closing == closing) {
            pairs.emplace_back(openers[k].position, i);
            openers.resize(k);
            break;
          }
        }
      }
    }
    std::sort(pairs.begin(), pairs.end());
    return pairs;
  }

  // N0.
  void bracketPairs() {
    const C opposite = embedding_ == C::L ? C::R : C::L;
    for (const auto& [open, close] : findBracketPairs()) {
      bool sameInside = false;
      bool oppositeInside = false;
      for (size_t i = open + 1; i < close && !sameInside; ++i) {
        const C d = strongDirection(t_[i]);
        sameInside = d == embedding_;
        oppositeInside = oppositeInside || d == opposite;
      }
      if (!sameInside && !oppositeInside) {
        continue;
      }
      C resolved = embedding_;
      if (!sameInside) {
        C before = sos_;
        for (size_t i = open; i-- > 0;) {
          if (strongDirection(t_[i]) != C::ON) {
            before = strongDirection(t_[i]);
            break;
          }
        }
        resolved = before == opposite ? opposite : embedding_;
      }
      setBracket(open, resolved);
      setBracket(close, resolved);
    }
  }

  // A bracket N0 resolved, and the marks (originally NSM) right after it, which W1 had made ON.
  void setBracket(size_t position, C direction) {
    t_[position] = direction;
    for (size_t i = position + 1; i < t_.size() && original_[sequence_[i]] == C::NSM; ++i) {
      t_[i] = direction;
    }
  }

  // N1, N2.
  void neutralTypes() {
    const size_t n = t_.size();
    for (size_t i = 0; i < n;) {
      if (!isNeutral(t_[i])) {
        ++i;
        continue;
      }
      size_t end = i;
      while (end < n && isNeutral(t_[end])) {
        ++end;
      }
      const C before = i == 0 ? sos_ : strongDirection(t_[i - 1]);
      const C after = end == n ? eos_ : strongDirection(t_[end]);
      std::fill(t_.begin() + i, t_.begin() + end, before == after ? before : embedding_);
      i = end;
    }
  }

  // I1, I2, and L1 for segment and paragraph separators.
  void implicitLevels() {
    for (size_t i : kept_) {
      const C c = types_[i];
      int16_t& level = levels_[i];
      if (original_[i] == C::S || original_[i] == C::B) {
        level = static_cast<int16_t>(paragraphLevel_);
      } else if (level % 2 == 0) {
        level += c == C::R ? 1 : c == C::AN || c == C::EN ? 2 : 0;
      } else {
        level += c == C::L || c == C::EN || c == C::AN ? 1 : 0;
      }
    }
  }

  const C* original_;
  const uint32_t* codePoints_;
  size_t count_;
  BracketSource* brackets_;
  C* types_;
  int16_t* levels_;
  int paragraphLevel_ = 0;
  std::vector<int32_t> matchingPdi_;
  std::vector<size_t> kept_;
  std::vector<LevelRun> runs_;
  // The isolating run sequence being resolved: its characters and their working classes.
  std::vector<size_t> sequence_;
  std::vector<C> t_;
  C sos_ = C::L;
  C eos_ = C::L;
  C embedding_ = C::L;
};

}  // namespace

BidiClass firstStrongClass(const BidiClass* classes, size_t count) {
  int isolates = 0;
  for (size_t i = 0; i < count; ++i) {
    const C c = classes[i];
    if (isIsolateInitiator(c)) {
      ++isolates;
    } else if (c == C::PDI) {
      isolates -= isolates > 0 ? 1 : 0;
    } else if (c == C::B) {
      break;
    } else if (isolates == 0 && (c == C::L || c == C::R || c == C::AL)) {
      return c;
    }
  }
  return C::ON;
}

int resolveBidiClasses(const BidiClass* classes, const uint32_t* codePoints, size_t count,
                       int32_t direction, BracketSource* brackets, BidiClass* resolvedClasses,
                       int16_t* levels) {
  int firstLevel = -1;
  for (size_t begin = 0; begin < count;) {
    size_t end = begin;
    while (end < count && classes[end] != C::B) {
      ++end;
    }
    end = std::min(end + 1, count);  // the separator belongs to the paragraph it ends
    ParagraphResolver paragraph(classes + begin, codePoints ? codePoints + begin : nullptr,
                                end - begin, brackets, resolvedClasses + begin, levels + begin);
    const int level = paragraph.resolve(direction);
    firstLevel = firstLevel < 0 ? level : firstLevel;
    begin = end;
  }
  if (firstLevel < 0) {
    firstLevel = direction < 0 ? 1 : 0;
  }
  return firstLevel;
}

}  // namespace vesk::plugin::lib

// The Unicode block list, which decides how much of the character file one load reads.
#ifndef WAVEFORM_TEXT_UNICODE_BLOCKS_H
#define WAVEFORM_TEXT_UNICODE_BLOCKS_H

#include <array>
#include <cstdint>

namespace vesk::plugin::lib {

// The last code point of every block of the Unicode 11 block list, ascending.
const std::array<uint32_t, 291>& unicodeBlockEnds();

// The last code point of the block holding `codePoint`: the first block end at or above it, or
// 0xFFFFFFFF above every block.
uint32_t unicodeBlockEnd(uint32_t codePoint);

}  // namespace vesk::plugin::lib

#endif  // WAVEFORM_TEXT_UNICODE_BLOCKS_H

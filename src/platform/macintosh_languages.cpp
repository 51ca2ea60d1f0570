// The Macintosh language codes of Windows language identifiers, and the choice of the language a
// font name is read in, shared by the font file reader and the installed-font enumeration so that
// both name a face alike.
#include <algorithm>
#include <cstdint>
#include <iterator>
#include <utility>

#include "platform/system_services.h"

namespace platform {
namespace {

// Windows language identifier -> Macintosh language code, sorted by identifier. Languages that
// have no Macintosh counterpart carry the code 65535.
constexpr std::pair<uint16_t, uint16_t> kMacintoshCodes[] = {
    {0x0401, 12},    {0x0402, 44},    {0x0403, 130},   {0x0404, 33},    {0x0405, 38},
    {0x0406, 7},     {0x0407, 2},     {0x0408, 14},    {0x040A, 6},     {0x040B, 13},
    {0x040C, 1},     {0x040D, 10},    {0x040E, 26},    {0x040F, 15},    {0x0410, 3},
    {0x0411, 11},    {0x0412, 23},    {0x0413, 4},     {0x0414, 9},     {0x0415, 25},
    {0x0416, 8},     {0x0417, 65535}, {0x0418, 37},    {0x0419, 32},    {0x041A, 18},
    {0x041B, 39},    {0x041C, 36},    {0x041D, 5},     {0x041E, 22},    {0x041F, 17},
    {0x0420, 20},    {0x0421, 81},    {0x0422, 45},    {0x0423, 65535}, {0x0424, 40},
    {0x0425, 27},    {0x0426, 28},    {0x0427, 24},    {0x0428, 55},    {0x042A, 80},
    {0x042B, 51},    {0x042C, 65535}, {0x042D, 129},   {0x042E, 65535}, {0x042F, 43},
    {0x0432, 65535}, {0x0434, 65535}, {0x0435, 65535}, {0x0436, 141},   {0x0437, 52},
    {0x0438, 30},    {0x0439, 21},    {0x043A, 16},    {0x043B, 29},    {0x043E, 83},
    {0x043F, 48},    {0x0440, 65535}, {0x0441, 89},    {0x0442, 56},    {0x0443, 47},
    {0x0444, 135},   {0x0445, 67},    {0x0446, 70},    {0x0447, 69},    {0x0448, 65535},
    {0x0449, 74},    {0x044A, 75},    {0x044B, 73},    {0x044C, 72},    {0x044D, 68},
    {0x044E, 66},    {0x044F, 65},    {0x0450, 58},    {0x0451, 63},    {0x0452, 128},
    {0x0453, 78},    {0x0454, 79},    {0x0456, 140},   {0x0457, 65535}, {0x045A, 65535},
    {0x045B, 65535}, {0x045D, 143},   {0x045E, 85},    {0x0461, 64},    {0x0462, 65535},
    {0x0463, 59},    {0x0464, 65535}, {0x0465, 65535}, {0x0468, 65535}, {0x046A, 65535},
    {0x046B, 132},   {0x046C, 65535}, {0x046D, 65535}, {0x046E, 65535}, {0x046F, 149},
    {0x0470, 65535}, {0x0478, 65535}, {0x047A, 65535}, {0x047C, 65535}, {0x047E, 142},
    {0x0480, 136},   {0x0481, 65535}, {0x0482, 65535}, {0x0483, 65535}, {0x0484, 1},
    {0x0485, 65535}, {0x0486, 65535}, {0x0487, 90},    {0x0488, 65535}, {0x048C, 65535},
    {0x0801, 12},    {0x0804, 33},    {0x0807, 2},     {0x080A, 6},     {0x080C, 1},
    {0x0810, 3},     {0x0813, 4},     {0x0814, 9},     {0x0816, 8},     {0x081A, 42},
    {0x081D, 65535}, {0x082C, 65535}, {0x082E, 65535}, {0x083B, 29},    {0x083C, 35},
    {0x083E, 83},    {0x0843, 47},    {0x0845, 67},    {0x0850, 57},    {0x085D, 143},
    {0x085F, 65535}, {0x086B, 132},   {0x0C01, 12},    {0x0C04, 33},    {0x0C07, 2},
    {0x0C0A, 6},     {0x0C0C, 1},     {0x0C1A, 42},    {0x0C3B, 29},    {0x0C6B, 132},
    {0x1001, 12},    {0x1004, 33},    {0x1007, 2},     {0x100A, 6},     {0x100C, 1},
    {0x101A, 18},    {0x103B, 29},    {0x1401, 12},    {0x1404, 33},    {0x1407, 2},
    {0x140A, 6},     {0x140C, 1},     {0x141A, 65535}, {0x143B, 29},    {0x1801, 12},
    {0x180A, 6},     {0x180C, 1},     {0x181A, 42},    {0x183B, 29},    {0x1C01, 12},
    {0x1C0A, 6},     {0x1C1A, 42},    {0x1C3B, 29},    {0x2001, 12},    {0x200A, 6},
    {0x201A, 65535}, {0x203B, 29},    {0x2401, 12},    {0x240A, 6},     {0x243B, 29},
    {0x2801, 12},    {0x280A, 6},     {0x2C01, 12},    {0x2C0A, 6},     {0x3001, 12},
    {0x300A, 6},     {0x3401, 12},    {0x340A, 6},     {0x3801, 12},    {0x380A, 6},
    {0x3C01, 12},    {0x3C0A, 6},     {0x4001, 12},    {0x400A, 6},     {0x440A, 6},
    {0x480A, 6},     {0x4C0A, 6},     {0x500A, 6},     {0x540A, 6},
};

constexpr bool sortedByIdentifier() {
  for (size_t i = 1; i < std::size(kMacintoshCodes); ++i) {
    if (kMacintoshCodes[i - 1].first >= kMacintoshCodes[i].first) {
      return false;
    }
  }
  return true;
}
static_assert(sortedByIdentifier(), "the table is searched by bisection");

}  // namespace

uint16_t macintoshLanguageCode(uint16_t windowsLanguageId) {
  const auto* end = std::end(kMacintoshCodes);
  const auto* entry = std::lower_bound(
      std::begin(kMacintoshCodes), end, windowsLanguageId,
      [](const std::pair<uint16_t, uint16_t>& e, uint16_t id) { return e.first < id; });
  if (entry == end || entry->first != windowsLanguageId) {
    return 0;
  }
  return entry->second;
}

size_t preferredNameLanguage(const std::vector<uint16_t>& languages, uint16_t userLanguageId) {
  if (languages.size() <= 1) {
    return 0;
  }
  const auto at = [&](auto found) { return static_cast<size_t>(found - languages.begin()); };
  if (const auto exact = std::find(languages.begin(), languages.end(), userLanguageId);
      exact != languages.end()) {
    return at(exact);
  }
  const uint16_t userCode = macintoshLanguageCode(userLanguageId);
  const auto sameCode = [&](uint16_t code) {
    return std::find_if(languages.begin(), languages.end(),
                        [&](uint16_t language) { return macintoshLanguageCode(language) == code; });
  };
  if (const auto related = sameCode(userCode); related != languages.end()) {
    return at(related);
  }
  constexpr uint16_t kEnglishMacintoshCode = 0;
  if (const auto english = sameCode(kEnglishMacintoshCode); english != languages.end()) {
    return at(english);
  }
  return 0;
}

}  // namespace platform

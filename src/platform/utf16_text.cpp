#include "platform/utf16_text.h"

#include <cstddef>
#include <cstdint>

namespace platform {
namespace {

constexpr char32_t kReplacement = 0xFFFD;

// The length of the sequence a lead byte starts, and the smallest value it may encode (so that
// overlong forms are refused); 0 for a byte that cannot start a sequence.
struct Lead {
  int length;
  char32_t minimum;
};

Lead leadOf(unsigned char byte) {
  if (byte < 0x80) {
    return {1, 0};
  }
  if ((byte & 0xE0) == 0xC0) {
    return {2, 0x80};
  }
  if ((byte & 0xF0) == 0xE0) {
    return {3, 0x800};
  }
  if ((byte & 0xF8) == 0xF0) {
    return {4, 0x10000};
  }
  return {0, 0};
}

// Decodes the sequence at `at`; on success advances `at` past it, otherwise by one byte and
// answers U+FFFD.
char32_t decodeOne(const std::string& text, size_t& at) {
  const auto lead = static_cast<unsigned char>(text[at]);
  const Lead shape = leadOf(lead);
  if (shape.length == 0 || at + shape.length > text.size()) {
    ++at;
    return kReplacement;
  }
  char32_t value = shape.length == 1 ? lead : lead & (0x7F >> shape.length);
  for (int i = 1; i < shape.length; ++i) {
    const auto next = static_cast<unsigned char>(text[at + i]);
    if ((next & 0xC0) != 0x80) {
      ++at;
      return kReplacement;
    }
    value = (value << 6) | (next & 0x3F);
  }
  if (value < shape.minimum || value > 0x10FFFF || (value >= 0xD800 && value <= 0xDFFF)) {
    ++at;
    return kReplacement;
  }
  at += shape.length;
  return value;
}

void appendUtf8(std::string& out, char32_t value) {
  if (value < 0x80) {
    out += static_cast<char>(value);
  } else if (value < 0x800) {
    out += static_cast<char>(0xC0 | (value >> 6));
    out += static_cast<char>(0x80 | (value & 0x3F));
  } else if (value < 0x10000) {
    out += static_cast<char>(0xE0 | (value >> 12));
    out += static_cast<char>(0x80 | ((value >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (value & 0x3F));
  } else {
    out += static_cast<char>(0xF0 | (value >> 18));
    out += static_cast<char>(0x80 | ((value >> 12) & 0x3F));
    out += static_cast<char>(0x80 | ((value >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (value & 0x3F));
  }
}

bool isHighSurrogate(char16_t unit) {
  return unit >= 0xD800 && unit <= 0xDBFF;
}
bool isLowSurrogate(char16_t unit) {
  return unit >= 0xDC00 && unit <= 0xDFFF;
}

}  // namespace

std::u16string toUtf16(const std::string& utf8) {
  std::u16string out;
  out.reserve(utf8.size());
  size_t at = 0;
  while (at < utf8.size()) {
    const char32_t value = decodeOne(utf8, at);
    if (value < 0x10000) {
      out += static_cast<char16_t>(value);
    } else {
      out += static_cast<char16_t>(0xD800 + ((value - 0x10000) >> 10));
      out += static_cast<char16_t>(0xDC00 + ((value - 0x10000) & 0x3FF));
    }
  }
  return out;
}

std::string toUtf8(const std::u16string& utf16) {
  std::string out;
  out.reserve(utf16.size());
  for (size_t at = 0; at < utf16.size(); ++at) {
    const char16_t unit = utf16[at];
    if (isHighSurrogate(unit) && at + 1 < utf16.size() && isLowSurrogate(utf16[at + 1])) {
      appendUtf8(out, 0x10000 + ((char32_t(unit) - 0xD800) << 10) + (utf16[at + 1] - 0xDC00));
      ++at;
    } else if (isHighSurrogate(unit) || isLowSurrogate(unit)) {
      appendUtf8(out, kReplacement);
    } else {
      appendUtf8(out, unit);
    }
  }
  return out;
}

}  // namespace platform

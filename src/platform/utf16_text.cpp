#include "platform/utf16_text.h"

#include <cstdint>

namespace platform {
namespace {

constexpr char16_t kReplacement = 0xFFFD;

bool isHighSurrogate(char32_t unit) {
  return unit >= 0xD800 && unit <= 0xDBFF;
}
bool isLowSurrogate(char32_t unit) {
  return unit >= 0xDC00 && unit <= 0xDFFF;
}

void appendUtf8(char32_t codePoint, std::string& out) {
  if (codePoint < 0x80) {
    out += static_cast<char>(codePoint);
  } else if (codePoint < 0x800) {
    out += static_cast<char>(0xC0 | (codePoint >> 6));
    out += static_cast<char>(0x80 | (codePoint & 0x3F));
  } else if (codePoint < 0x10000) {
    out += static_cast<char>(0xE0 | (codePoint >> 12));
    out += static_cast<char>(0x80 | ((codePoint >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (codePoint & 0x3F));
  } else {
    out += static_cast<char>(0xF0 | (codePoint >> 18));
    out += static_cast<char>(0x80 | ((codePoint >> 12) & 0x3F));
    out += static_cast<char>(0x80 | ((codePoint >> 6) & 0x3F));
    out += static_cast<char>(0x80 | (codePoint & 0x3F));
  }
}

void appendUtf16(char32_t codePoint, std::u16string& out) {
  if (codePoint < 0x10000) {
    out += static_cast<char16_t>(codePoint);
  } else {
    codePoint -= 0x10000;
    out += static_cast<char16_t>(0xD800 + (codePoint >> 10));
    out += static_cast<char16_t>(0xDC00 + (codePoint & 0x3FF));
  }
}

// The well-formed UTF-8 sequences a lead byte starts: how many continuation bytes follow, the
// bits the lead contributes, and the range allowed for the first continuation byte (narrower
// after E0, ED, F0 and F4, which excludes overlong forms, surrogates and code points past
// U+10FFFF). A byte that starts no sequence has no continuation count.
struct Utf8Lead {
  int continuations = -1;
  char32_t bits = 0;
  uint8_t firstLow = 0x80;
  uint8_t firstHigh = 0xBF;
};

Utf8Lead utf8Lead(uint8_t byte) {
  if (byte >= 0xC2 && byte <= 0xDF) {
    return {1, static_cast<char32_t>(byte & 0x1F)};
  }
  if (byte >= 0xE0 && byte <= 0xEF) {
    return {2, static_cast<char32_t>(byte & 0x0F), static_cast<uint8_t>(byte == 0xE0 ? 0xA0 : 0x80),
            static_cast<uint8_t>(byte == 0xED ? 0x9F : 0xBF)};
  }
  if (byte >= 0xF0 && byte <= 0xF4) {
    return {3, static_cast<char32_t>(byte & 0x07), static_cast<uint8_t>(byte == 0xF0 ? 0x90 : 0x80),
            static_cast<uint8_t>(byte == 0xF4 ? 0x8F : 0xBF)};
  }
  return {};
}

}  // namespace

std::string toUtf8(const std::u16string& text) {
  std::string out;
  out.reserve(text.size());
  for (size_t i = 0; i < text.size(); ++i) {
    char32_t unit = text[i];
    if (isHighSurrogate(unit) && i + 1 < text.size() && isLowSurrogate(text[i + 1])) {
      unit = 0x10000 + ((unit - 0xD800) << 10) + (text[i + 1] - 0xDC00);
      ++i;
    } else if (isHighSurrogate(unit) || isLowSurrogate(unit)) {
      unit = kReplacement;
    }
    appendUtf8(unit, out);
  }
  return out;
}

std::optional<std::string> toUtf8Strict(const std::u16string& text) {
  std::string out;
  out.reserve(text.size());
  for (size_t i = 0; i < text.size(); ++i) {
    char32_t unit = text[i];
    if (isHighSurrogate(unit)) {
      if (i + 1 == text.size() || !isLowSurrogate(text[i + 1])) {
        return std::nullopt;
      }
      unit = 0x10000 + ((unit - 0xD800) << 10) + (text[i + 1] - 0xDC00);
      ++i;
    } else if (isLowSurrogate(unit)) {
      return std::nullopt;
    }
    appendUtf8(unit, out);
  }
  return out;
}

std::u16string toUtf16(const std::string& text) {
  std::u16string out;
  out.reserve(text.size());
  size_t i = 0;
  while (i < text.size()) {
    const auto byte = static_cast<uint8_t>(text[i++]);
    if (byte < 0x80) {
      out += static_cast<char16_t>(byte);
      continue;
    }
    const Utf8Lead lead = utf8Lead(byte);
    if (lead.continuations < 0) {
      out += kReplacement;
      continue;
    }
    char32_t codePoint = lead.bits;
    uint8_t low = lead.firstLow;
    uint8_t high = lead.firstHigh;
    bool complete = true;
    for (int k = 0; k < lead.continuations; ++k) {
      const auto next = i < text.size() ? static_cast<uint8_t>(text[i]) : 0;
      if (i == text.size() || next < low || next > high) {
        complete = false;
        break;
      }
      codePoint = (codePoint << 6) | (next & 0x3F);
      ++i;
      low = 0x80;
      high = 0xBF;
    }
    if (complete) {
      appendUtf16(codePoint, out);
    } else {
      out += kReplacement;
    }
  }
  return out;
}

}  // namespace platform

#include "common/modified_utf8.h"

#include <cstdint>

namespace ocr {
namespace {

// A three-byte encoded surrogate: ED followed by A0..AF (high) or B0..BF (low).
bool IsSurrogate(const unsigned char* p, unsigned char first_of_range) {
  return p[0] == 0xED && (p[1] & 0xF0) == first_of_range && (p[2] & 0xC0) == 0x80;
}

uint32_t SurrogateValue(const unsigned char* p) {
  return 0xD000u | ((p[1] & 0x3Fu) << 6) | (p[2] & 0x3Fu);
}

void AppendFourByteUtf8(uint32_t codepoint, std::string& out) {
  out += static_cast<char>(0xF0 | (codepoint >> 18));
  out += static_cast<char>(0x80 | ((codepoint >> 12) & 0x3F));
  out += static_cast<char>(0x80 | ((codepoint >> 6) & 0x3F));
  out += static_cast<char>(0x80 | (codepoint & 0x3F));
}

}  // namespace

std::string ModifiedUtf8ToUtf8(const char* modified) {
  std::string out;
  if (modified == nullptr)
    return out;
  const auto* p = reinterpret_cast<const unsigned char*>(modified);
  while (*p != 0) {
    if (p[0] == 0xC0 && p[1] == 0x80) {
      out += '\0';
      p += 2;
    } else if (IsSurrogate(p, 0xA0) && IsSurrogate(p + 3, 0xB0)) {
      const uint32_t high = SurrogateValue(p) - 0xD800u;
      const uint32_t low = SurrogateValue(p + 3) - 0xDC00u;
      AppendFourByteUtf8(0x10000u + (high << 10) + low, out);
      p += 6;
    } else {
      out += static_cast<char>(*p++);
    }
  }
  return out;
}

}  // namespace ocr

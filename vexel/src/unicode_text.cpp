#include "unicode_text.h"

#include <unicode/uchar.h>
#include <unicode/unorm2.h>
#include <unicode/ustring.h>

#include <vector>

namespace Vexel::internal {
namespace {

constexpr char32_t kReplacement = 0xFFFD;

std::u16string ToUtf16(const std::u32string& text) {
  std::u16string out;
  out.reserve(text.size());
  for (char32_t c : text) {
    if (c >= 0x10000) {
      c -= 0x10000;
      out.push_back(static_cast<char16_t>(0xD800 + (c >> 10)));
      out.push_back(static_cast<char16_t>(0xDC00 + (c & 0x3FF)));
    } else {
      out.push_back(static_cast<char16_t>(c));
    }
  }
  return out;
}

std::u32string ToUtf32(const std::u16string& text) {
  std::u32string out;
  out.reserve(text.size());
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char32_t unit = text[i];
    if (unit >= 0xD800 && unit < 0xDC00 && i + 1 < text.size() && text[i + 1] >= 0xDC00 &&
        text[i + 1] < 0xE000) {
      out.push_back(0x10000 + ((unit - 0xD800) << 10) + (text[i + 1] - 0xDC00));
      ++i;
    } else {
      out.push_back(unit);
    }
  }
  return out;
}

std::u32string ComposeCanonically(const std::u32string& text) {
  UErrorCode status = U_ZERO_ERROR;
  const UNormalizer2* nfc = unorm2_getNFCInstance(&status);
  if (U_FAILURE(status))
    return text;
  const std::u16string source = ToUtf16(text);
  std::vector<UChar> out(source.size() * 3 + 16);
  const int32_t length = unorm2_normalize(nfc, reinterpret_cast<const UChar*>(source.data()),
                                          static_cast<int32_t>(source.size()), out.data(),
                                          static_cast<int32_t>(out.size()), &status);
  if (U_FAILURE(status))
    return text;
  return ToUtf32(std::u16string(reinterpret_cast<const char16_t*>(out.data()),
                                static_cast<std::size_t>(length)));
}

}  // namespace

std::u32string DecodeUtf8(const std::string& text) {
  std::u32string out;
  out.reserve(text.size());
  const auto* bytes = reinterpret_cast<const unsigned char*>(text.data());
  const std::size_t n = text.size();
  std::size_t i = 0;
  while (i < n) {
    const unsigned char lead = bytes[i];
    int length = 0;
    char32_t c = 0;
    char32_t minimum = 0;
    if (lead < 0x80) {
      out.push_back(lead);
      ++i;
      continue;
    } else if (lead >= 0xC2 && lead <= 0xDF) {
      length = 2, c = lead & 0x1F, minimum = 0x80;
    } else if (lead >= 0xE0 && lead <= 0xEF) {
      length = 3, c = lead & 0x0F, minimum = 0x800;
    } else if (lead >= 0xF0 && lead <= 0xF4) {
      length = 4, c = lead & 0x07, minimum = 0x10000;
    } else {
      out.push_back(kReplacement);
      ++i;
      continue;
    }
    int taken = 1;
    while (taken < length && i + taken < n && (bytes[i + taken] & 0xC0) == 0x80) {
      c = (c << 6) | (bytes[i + taken] & 0x3F);
      ++taken;
    }
    if (taken < length || c < minimum || c > 0x10FFFF || (c >= 0xD800 && c < 0xE000)) {
      out.push_back(kReplacement);
      i += static_cast<std::size_t>(taken);
      continue;
    }
    out.push_back(c);
    i += static_cast<std::size_t>(length);
  }
  return out;
}

std::string EncodeUtf8(const std::u32string& text) {
  std::string out;
  out.reserve(text.size());
  for (char32_t c : text) {
    if (c < 0x80) {
      out.push_back(static_cast<char>(c));
    } else if (c < 0x800) {
      out.push_back(static_cast<char>(0xC0 | (c >> 6)));
      out.push_back(static_cast<char>(0x80 | (c & 0x3F)));
    } else if (c < 0x10000) {
      out.push_back(static_cast<char>(0xE0 | (c >> 12)));
      out.push_back(static_cast<char>(0x80 | ((c >> 6) & 0x3F)));
      out.push_back(static_cast<char>(0x80 | (c & 0x3F)));
    } else {
      out.push_back(static_cast<char>(0xF0 | (c >> 18)));
      out.push_back(static_cast<char>(0x80 | ((c >> 12) & 0x3F)));
      out.push_back(static_cast<char>(0x80 | ((c >> 6) & 0x3F)));
      out.push_back(static_cast<char>(0x80 | (c & 0x3F)));
    }
  }
  return out;
}

bool IsWhiteSpace(char32_t c) {
  return u_isUWhiteSpace(static_cast<UChar32>(c)) != 0;
}

bool IsSmallOrCaselessLetter(char32_t c) {
  const auto u = static_cast<UChar32>(c);
  return u_isalpha(u) != 0 && u_isupper(u) == 0 && u_istitle(u) == 0;
}

bool IsLineBreak(char32_t c) {
  return c == U'\n' || c == U'\r' || c == 0x2028 || c == 0x2029 || c == 0x0B || c == 0x0C ||
         c == 0x85;
}

std::u32string NormalizeForDisplay(const std::u32string& text) {
  std::u32string folded;
  folded.reserve(text.size());
  bool pending_space = false;
  for (char32_t c : ComposeCanonically(text)) {
    if (IsWhiteSpace(c)) {
      pending_space = !folded.empty();
      continue;
    }
    if (u_charType(static_cast<UChar32>(c)) == U_CONTROL_CHAR)
      continue;
    if (pending_space)
      folded.push_back(U' ');
    pending_space = false;
    folded.push_back(c);
  }
  return folded;
}

}  // namespace Vexel::internal

#pragma once

#include <string>

namespace Vexel::internal {

// UTF-8 to code points; each invalid or truncated sequence (overlong forms
// and surrogates included) becomes U+FFFD.
std::u32string DecodeUtf8(const std::string& text);
std::string EncodeUtf8(const std::u32string& text);

// The form a text is drawn in: canonical composition (NFC), control
// characters dropped, each run of white space (line breaks included) one
// space, none at either end.
std::u32string NormalizeForDisplay(const std::u32string& text);

bool IsWhiteSpace(char32_t c);
// A letter other than a capital: lowercase, or of a script without case.
// Such letters may reach below the baseline; capitals do not.
bool IsSmallOrCaselessLetter(char32_t c);
bool IsLineBreak(char32_t c);

}  // namespace Vexel::internal

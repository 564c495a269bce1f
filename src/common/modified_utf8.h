#pragma once

#include <string>

namespace ocr {

// Java hands strings to native code (GetStringUTFChars) in its modified
// UTF-8: U+0000 as the two bytes C0 80, and characters beyond U+FFFF as two
// three-byte surrogates. Text layout expects standard UTF-8, in which both
// forms are invalid, so an emoji or a rare CJK ideograph would be drawn as
// two replacement characters. This rewrites both forms; every other byte,
// an unpaired surrogate included, is copied unchanged.
std::string ModifiedUtf8ToUtf8(const char* modified);

}  // namespace ocr

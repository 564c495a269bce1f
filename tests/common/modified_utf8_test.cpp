#include "common/modified_utf8.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using ocr::ModifiedUtf8ToUtf8;

TEST(ModifiedUtf8, SupplementaryCharactersBecomeFourByteSequences) {
  // U+1F600 as Java's surrogate pair D83D DE00, between two letters.
  EXPECT_EQ(ModifiedUtf8ToUtf8("a\xED\xA0\xBD\xED\xB8\x80"
                               "b"),
            "a\xF0\x9F\x98\x80"
            "b");
  // U+20BB7, a CJK ideograph outside the basic plane (D842 DFB7).
  EXPECT_EQ(ModifiedUtf8ToUtf8("\xED\xA1\x82\xED\xBE\xB7"), "\xF0\xA0\xAE\xB7");
}

TEST(ModifiedUtf8, EncodedNulBecomesAZeroByte) {
  EXPECT_EQ(ModifiedUtf8ToUtf8("x\xC0\x80y"), std::string("x\0y", 3));
}

TEST(ModifiedUtf8, OtherTextPassesUnchanged) {
  const char* text =
      "\xE5\x96\xB6\xE6\xA5\xAD \xC3\x96"
      "ffnungszeiten";  // BMP CJK, Latin
  EXPECT_EQ(ModifiedUtf8ToUtf8(text), text);
  // An unpaired surrogate is left for the text layout to replace.
  EXPECT_EQ(ModifiedUtf8ToUtf8("\xED\xA0\xBDz"), "\xED\xA0\xBDz");
  EXPECT_EQ(ModifiedUtf8ToUtf8(nullptr), "");
  EXPECT_EQ(ModifiedUtf8ToUtf8(""), "");
}

}  // namespace

// The characters behind a recogniser's classes: class 0 is the CTC blank.
#ifndef TEXTREADER_ALPHABET_H_
#define TEXTREADER_ALPHABET_H_

#include <string>
#include <vector>

namespace textreader {

using Alphabet = std::vector<std::string>;  // UTF-8 per class, "" for the blank

// The English recogniser's 97 classes: blank, '0'..'~', '!'..'/', space, and
// a second space.
Alphabet EnglishAlphabet();

// The Chinese recogniser's classes: blank, one per line of the dictionary
// file, space. Throws ModelError naming the file when it is missing or empty.
Alphabet LoadDictionaryAlphabet(const std::string& path);

}  // namespace textreader

#endif  // TEXTREADER_ALPHABET_H_

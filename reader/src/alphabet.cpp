#include "alphabet.h"

#include <fstream>

#include "textreader/text_reader.h"

namespace textreader {

Alphabet EnglishAlphabet() {
  Alphabet alphabet{""};
  for (char c = '0'; c <= '~'; ++c)
    alphabet.emplace_back(1, c);
  for (char c = '!'; c <= '/'; ++c)
    alphabet.emplace_back(1, c);
  alphabet.emplace_back(" ");
  alphabet.emplace_back(" ");
  return alphabet;
}

Alphabet LoadDictionaryAlphabet(const std::string& path) {
  std::ifstream file(path);
  if (!file)
    throw ModelError("dictionary file missing: " + path);
  Alphabet alphabet{""};
  std::string line;
  while (std::getline(file, line)) {
    if (!line.empty() && line.back() == '\r')
      line.pop_back();
    alphabet.push_back(line);
  }
  if (alphabet.size() < 2)
    throw ModelError("dictionary file empty: " + path);
  alphabet.emplace_back(" ");
  return alphabet;
}

}  // namespace textreader

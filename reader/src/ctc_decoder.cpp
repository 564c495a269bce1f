#include "ctc_decoder.h"

#include <algorithm>
#include <cstddef>

namespace textreader {

Decoded DecodeCtc(const float* probabilities, int steps, const Alphabet& alphabet) {
  const int classes = static_cast<int>(alphabet.size());
  std::vector<DecodedCharacter> characters;
  std::vector<float> scores;
  int previous = 0;
  for (int t = 0; t < steps; ++t) {
    const float* row = probabilities + static_cast<std::ptrdiff_t>(t) * classes;
    const int best = static_cast<int>(std::max_element(row, row + classes) - row);
    if (best != 0 && best == previous) {
      characters.back().last_step = t;
    } else if (best != 0) {
      characters.push_back({alphabet[best], t, t});
      scores.push_back(row[best]);
    }
    previous = best;
  }
  // Spaces at the ends separate nothing.
  const auto is_space = [](const DecodedCharacter& c) { return c.text == " "; };
  std::size_t begin = 0;
  std::size_t end = characters.size();
  while (begin < end && is_space(characters[begin]))
    ++begin;
  while (end > begin && is_space(characters[end - 1]))
    --end;
  Decoded decoded;
  float sum = 0.0F;
  for (std::size_t i = begin; i < end; ++i) {
    decoded.text += characters[i].text;
    decoded.characters.push_back(characters[i]);
    sum += scores[i];
  }
  if (end > begin)
    decoded.confidence = sum / static_cast<float>(end - begin);
  return decoded;
}

}  // namespace textreader

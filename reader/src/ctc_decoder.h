// Greedy CTC decoding of a recogniser's per-step class probabilities.
#ifndef TEXTREADER_CTC_DECODER_H_
#define TEXTREADER_CTC_DECODER_H_

#include <string>
#include <vector>

#include "alphabet.h"

namespace textreader {

struct DecodedCharacter {
  std::string text;
  int first_step = 0;  // the steps where the character's run starts and ends
  int last_step = 0;
};

struct Decoded {
  std::string text;
  // Mean of the emitted characters' probabilities (at the run's first step);
  // 0 without characters.
  float confidence = 0.0F;
  std::vector<DecodedCharacter> characters;
};

// `probabilities` holds `steps` rows of `alphabet.size()` class
// probabilities. The best class of each step; runs of one class merged;
// blanks dropped; spaces at either end trimmed.
Decoded DecodeCtc(const float* probabilities, int steps, const Alphabet& alphabet);

}  // namespace textreader

#endif  // TEXTREADER_CTC_DECODER_H_

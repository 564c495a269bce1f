#include "ctc_decoder.h"

#include <algorithm>
#include <cstddef>
#include <tuple>
#include <utility>
#include <vector>

namespace textreader {
namespace {

// A gap between two characters where the space classes reach this
// probability at some step is a word boundary, though the blank won every
// step of it. The recognisers often read widely spaced capitals ("BREAK
// GLASS") with a space of 0.3 to 0.5 under the blank, and the letters of a
// word with next to none.
constexpr float kSpaceInGap = 0.25F;

// Class probabilities of one step, with every class of one character (the
// English recogniser has two spaces) counted as one.
class Step {
 public:
  Step(const float* row, int classes, const std::vector<int>& spaces)
      : row_(row), classes_(classes), spaces_(spaces) {
    for (const int c : spaces)
      space_ += row[c];
  }
  float space() const { return space_; }
  // The winning class (a space as the first space class), and its probability.
  std::pair<int, float> Best() const {
    const int best = static_cast<int>(std::max_element(row_, row_ + classes_) - row_);
    const bool is_space = std::find(spaces_.begin(), spaces_.end(), best) != spaces_.end();
    if (is_space || (!spaces_.empty() && space_ > row_[best]))
      return {spaces_.front(), space_};
    return {best, row_[best]};
  }

 private:
  const float* row_;
  int classes_;
  const std::vector<int>& spaces_;
  float space_ = 0.0F;
};

bool IsSpace(const DecodedCharacter& c) {
  return c.text == " ";
}

}  // namespace

Decoded DecodeCtc(const float* probabilities, int steps, const Alphabet& alphabet) {
  const int classes = static_cast<int>(alphabet.size());
  std::vector<int> spaces;
  for (int c = 1; c < classes; ++c) {
    if (alphabet[c] == " ")
      spaces.push_back(c);
  }
  std::vector<DecodedCharacter> characters;
  std::vector<float> scores;  // per character; none for a space found in a gap
  int previous = 0;
  // The most likely space since the last character, and where.
  float gap_space = 0.0F;
  int gap_step = 0;
  for (int t = 0; t < steps; ++t) {
    const Step step(probabilities + static_cast<std::ptrdiff_t>(t) * classes, classes, spaces);
    const auto [best, p] = step.Best();
    const bool space = !spaces.empty() && best == spaces.front();
    if (best == 0) {
      if (step.space() > gap_space)
        std::tie(gap_space, gap_step) = std::make_pair(step.space(), t);
    } else if (best == previous || (space && !characters.empty() && IsSpace(characters.back()))) {
      // The character's run goes on; a space is one, however many runs it takes.
      characters.back().last_step = t;
    } else {
      if (!space && gap_space >= kSpaceInGap && !characters.empty() &&
          !IsSpace(characters.back())) {
        characters.push_back({" ", gap_step, gap_step});
        scores.push_back(-1.0F);
      }
      characters.push_back({alphabet[best], t, t});
      scores.push_back(p);
      gap_space = 0.0F;
    }
    previous = best;
  }
  // Spaces at the ends separate nothing.
  std::size_t begin = 0;
  std::size_t end = characters.size();
  while (begin < end && IsSpace(characters[begin]))
    ++begin;
  while (end > begin && IsSpace(characters[end - 1]))
    --end;
  Decoded decoded;
  float sum = 0.0F;
  int scored = 0;
  for (std::size_t i = begin; i < end; ++i) {
    decoded.text += characters[i].text;
    decoded.characters.push_back(characters[i]);
    if (scores[i] >= 0.0F) {
      sum += scores[i];
      ++scored;
    }
  }
  if (scored > 0)
    decoded.confidence = sum / static_cast<float>(scored);
  return decoded;
}

}  // namespace textreader

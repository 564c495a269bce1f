#include "character_boxes.h"

#include <algorithm>

namespace textreader {

std::vector<CharacterBox> CharacterBoxes(const Reading& reading, const Corners& line) {
  const std::vector<DecodedCharacter>& characters = reading.decoded.characters;
  const std::size_t n = characters.size();
  if (n == 0 || reading.steps <= 0 || reading.content_share <= 0.0F)
    return {};
  // Centres in steps, then in shares of the line's width.
  std::vector<float> centre(n);
  for (std::size_t i = 0; i < n; ++i)
    centre[i] = 0.5F * static_cast<float>(characters[i].first_step + characters[i].last_step + 1);
  const float to_share = 1.0F / (static_cast<float>(reading.steps) * reading.content_share);
  std::vector<float> bound(n + 1);
  for (std::size_t i = 1; i < n; ++i)
    bound[i] = 0.5F * (centre[i - 1] + centre[i]);
  if (n == 1) {
    bound[0] = 0.0F;
    bound[1] = static_cast<float>(reading.steps) * reading.content_share;
  } else {
    bound[0] = centre[0] - (bound[1] - centre[0]);
    bound[n] = centre[n - 1] + (centre[n - 1] - bound[n - 1]);
  }
  std::vector<CharacterBox> boxes;
  for (std::size_t i = 0; i < n; ++i) {
    if (characters[i].text == " ")
      continue;
    const float u0 = std::clamp(bound[i] * to_share, 0.0F, 1.0F);
    const float u1 = std::clamp(bound[i + 1] * to_share, 0.0F, 1.0F);
    boxes.push_back({characters[i].text,
                     {PointAt(line, u0, 0.0F), PointAt(line, u1, 0.0F), PointAt(line, u1, 1.0F),
                      PointAt(line, u0, 1.0F)}});
  }
  return boxes;
}

}  // namespace textreader

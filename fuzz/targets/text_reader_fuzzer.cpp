// The text reader as the host calls it: an image of 0..400 pixels a side,
// 1, 3 or 4 channels, 8 or 16 bits, with shapes and text-like strokes, read
// at one of a few detector sizes, with character boxes or without. Only the
// documented refusal (std::invalid_argument for an empty image or another
// type) may leave Read(); what it returns must be well-formed.
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <stdexcept>

#include <opencv2/core.hpp>

#include "support/fuzz_input.h"
#include "support/synthetic_image.h"
#include "textreader/text_reader.h"

namespace {

// Loading takes most of a second: one reader per setting, kept.
const textreader::TextReader& Reader(int pick) {
  static std::unique_ptr<textreader::TextReader> readers[3];
  std::unique_ptr<textreader::TextReader>& reader = readers[pick];
  if (!reader) {
    static constexpr int kLongSides[] = {960, 32, 320};
    textreader::ReaderOptions options;
    options.model_dir = TEXTREADER_MODEL_DIR;
    options.detection_long_side = kLongSides[pick];
    options.character_boxes = pick != 1;
    reader = std::make_unique<textreader::TextReader>(options);
  }
  return *reader;
}

bool Finite(cv::Point2f p) {
  return std::isfinite(p.x) && std::isfinite(p.y);
}

void CheckLine(const textreader::TextLine& line) {
  if (!Finite(line.rect.center) || !std::isfinite(line.rect.angle) ||
      !(line.rect.size.width >= 0) || !(line.rect.size.height >= 0))
    std::abort();
  if (!(line.confidence >= 0.0F && line.confidence <= 1.0F) || line.text.empty())
    std::abort();
  for (const cv::Point2f& corner : line.corners)
    if (!Finite(corner))
      std::abort();
  for (const textreader::CharacterBox& box : line.characters)
    if (box.text.empty() || !Finite(box.corners[0]) || !Finite(box.corners[2]))
      std::abort();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  ocr_fuzz::FuzzInput in(data, size);
  const int rows = in.Side(400);
  const int cols = in.Side(400);
  const int channels = in.Channels();
  const bool sixteen_bit = in.Byte() % 8 == 0;
  const int pick = in.Byte() % 3;
  cv::Mat image = ocr_fuzz::SyntheticImage(in, rows, cols, channels);
  if (sixteen_bit)
    image.convertTo(image, CV_16U, 257.0);
  const bool readable = !image.empty() && !sixteen_bit && channels != 1;
  try {
    for (const textreader::TextLine& line : Reader(pick).Read(image))
      CheckLine(line);
    if (!readable)
      std::abort();  // refused input was read
  } catch (const std::invalid_argument&) {
    if (readable)
      std::abort();
  }
  return 0;
}

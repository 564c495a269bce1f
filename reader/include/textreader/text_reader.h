// A learned text reader: finds the text lines of a photograph and reads them.
//
// Detection (a DB segmentation network), a 0°/180° direction classifier and a
// CTC line recogniser, run through ONNX Runtime with OpenCV around them.
//
// Geometry convention, shared with the engine: a line's rectangle is a
// cv::RotatedRect in the input image's pixels, y down, angle in degrees,
// with the width running along the reading direction. An upright line has an
// angle near 0; a line upside down has an angle near ±180 (its text is read
// the right way up all the same); text running downwards has an angle near
// 90. `corners` starts at the top-left corner as a reader of the line sees it
// and goes clockwise on the page: top-left, top-right, bottom-right,
// bottom-left, in reading terms.
#ifndef TEXTREADER_TEXT_READER_H_
#define TEXTREADER_TEXT_READER_H_

#include <array>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include <opencv2/core.hpp>

namespace textreader {

// A model file missing, unreadable or not a model of the expected kind, or a
// runtime that cannot start. The message names the file.
class ModelError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// Which recogniser reads the lines.
enum class Script {
  kLatin,    // English letters, digits, ASCII punctuation
  kChinese,  // Chinese characters, Latin letters, digits, punctuation
};

struct ReaderOptions {
  // Folder holding the models (see README: where setup puts them).
  std::string model_dir;
  Script script = Script::kLatin;
  // The detector sees the image scaled so that its long side is this.
  int detection_long_side = 960;
  // ONNX Runtime intra-op threads per session.
  int threads = 1;
  // Recognise the lines; when false, lines come with empty text and
  // confidence, for callers that read the upright crops with another
  // recogniser.
  bool recognise = true;
  // Report a box per character (from the CTC steps' positions).
  bool character_boxes = false;
  // Lines read with a lower confidence (0..1) are dropped as misreadings.
  float min_confidence = 0.5F;
  // A detected box is kept when the detector's mean text probability inside
  // it reaches this (0..1).
  float box_threshold = 0.6F;
  // The recogniser reads each line padded to at least this width (pixels at
  // 48 high). Its cost grows with the width: a short word padded to 320
  // costs as much as a long line.
  int recognition_min_width = 320;
};

struct CharacterBox {
  std::string text;  // one character, UTF-8
  std::array<cv::Point2f, 4> corners;
};

struct TextLine {
  cv::RotatedRect rect;
  std::array<cv::Point2f, 4> corners;
  std::string text;                      // UTF-8
  float confidence = 0.0F;               // 0..1
  std::vector<CharacterBox> characters;  // only with ReaderOptions::character_boxes
};

// Where the time of one Read went, for measuring.
struct ReadTimings {
  double detection_ms = 0.0;       // the detector and its boxes
  double classification_ms = 0.0;  // upright crops and the 0/180 classifier
  double recognition_ms = 0.0;     // the recogniser, decoding and grouping
  int boxes = 0;                   // boxes the detector found
};

class TextReader {
 public:
  // Loads the detector, classifier and the script's recogniser from
  // options.model_dir. Throws ModelError naming the file that is missing or
  // does not load, std::invalid_argument for options out of range.
  explicit TextReader(const ReaderOptions& options);
  ~TextReader();
  TextReader(const TextReader&) = delete;
  TextReader& operator=(const TextReader&) = delete;

  // The text lines of an 8-bit image, R G B or R G B A, in reading order (top
  // to bottom, then left to right). Throws std::invalid_argument for an empty
  // image or another type; an image with no text gives no lines. Safe to call
  // from one thread at a time.
  std::vector<TextLine> Read(const cv::Mat& image) const;
  // The same, telling where the time went.
  std::vector<TextLine> Read(const cv::Mat& image, ReadTimings* timings) const;

 private:
  struct Models;
  ReaderOptions options_;
  std::unique_ptr<Models> models_;
};

// The line's pixels turned upright (reading direction to the right), scaled
// to `height` pixels high with its aspect kept: what a recogniser reads.
cv::Mat UprightCrop(const cv::Mat& image, const TextLine& line, int height);

}  // namespace textreader

#endif  // TEXTREADER_TEXT_READER_H_

#include "textreader/text_reader.h"

#include <chrono>
#include <stdexcept>

#include <opencv2/imgproc.hpp>

#include "alphabet.h"
#include "box_geometry.h"
#include "character_boxes.h"
#include "db_boxes.h"
#include "detector.h"
#include "direction_classifier.h"
#include "line_grouping.h"
#include "recogniser.h"
#include "upright_crop.h"

namespace textreader {
namespace {

constexpr int kMinLongSide = 32;
constexpr int kMaxLongSide = 4096;
constexpr int kMaxThreads = 256;

void CheckOptions(const ReaderOptions& options) {
  if (options.detection_long_side < kMinLongSide || options.detection_long_side > kMaxLongSide)
    throw std::invalid_argument("text reader: detection_long_side must be in 32..4096, not " +
                                std::to_string(options.detection_long_side));
  if (options.threads < 0 || options.threads > kMaxThreads)
    throw std::invalid_argument("text reader: threads must be in 0..256, not " +
                                std::to_string(options.threads));
  if (options.recognition_min_width < 8 || options.recognition_min_width > kMaxCropWidth)
    throw std::invalid_argument("text reader: recognition_min_width must be in 8..4096, not " +
                                std::to_string(options.recognition_min_width));
  if (!(options.min_confidence >= 0.0F && options.min_confidence <= 1.0F) ||
      !(options.box_threshold >= 0.0F && options.box_threshold <= 1.0F))
    throw std::invalid_argument("text reader: min_confidence and box_threshold must be in 0..1");
}

void CheckImage(const cv::Mat& image) {
  if (image.empty())
    throw std::invalid_argument("text reader: the image is empty");
  if (image.type() != CV_8UC3 && image.type() != CV_8UC4)
    throw std::invalid_argument("text reader: the image must be 8-bit R G B or R G B A, not " +
                                std::to_string(8 * image.elemSize1()) + "-bit with " +
                                std::to_string(image.channels()) + " channel(s)");
}

// Milliseconds since the last lap.
class Stopwatch {
 public:
  double Lap() {
    const auto now = std::chrono::steady_clock::now();
    const double ms = std::chrono::duration<double, std::milli>(now - last_).count();
    last_ = now;
    return ms;
  }

 private:
  std::chrono::steady_clock::time_point last_ = std::chrono::steady_clock::now();
};

std::string ModelPath(const ReaderOptions& options, const char* file) {
  return options.model_dir + "/" + file;
}

}  // namespace

struct TextReader::Models {
  Detector detector;
  DirectionClassifier classifier;
  Recogniser recogniser;

  explicit Models(const ReaderOptions& o)
      : detector(ModelPath(o, "ch_PP-OCRv4_det_infer.onnx"), o.threads),
        classifier(ModelPath(o, "ch_ppocr_mobile_v2.0_cls_infer.onnx"), o.threads),
        recogniser(o.script == Script::kLatin ? ModelPath(o, "en_PP-OCRv4_rec.onnx")
                                              : ModelPath(o, "ch_PP-OCRv4_rec_infer.onnx"),
                   o.script == Script::kLatin
                       ? EnglishAlphabet()
                       : LoadDictionaryAlphabet(ModelPath(o, "ppocr_keys_v1.txt")),
                   o.threads, o.recognition_min_width) {}
};

TextReader::TextReader(const ReaderOptions& options) : options_(options) {
  CheckOptions(options_);
  models_ = std::make_unique<Models>(options_);
}

TextReader::~TextReader() = default;

std::vector<TextLine> TextReader::Read(const cv::Mat& image) const {
  return Read(image, nullptr);
}

std::vector<TextLine> TextReader::Read(const cv::Mat& image, ReadTimings* timings) const {
  CheckImage(image);
  Stopwatch stopwatch;

  // 1. Where the text is: boxes from the detector's probability map.
  DbParameters db;
  db.box_threshold = options_.box_threshold;
  const std::vector<cv::RotatedRect> boxes = BoxesFromMap(
      models_->detector.ProbabilityMap(image, options_.detection_long_side), db, image.size());
  const double detection_ms = stopwatch.Lap();

  // 2. Each box upright, as its text reads, and at the recogniser's height.
  std::vector<Corners> corners;
  std::vector<cv::Mat> crops;
  for (const cv::RotatedRect& box : boxes) {
    corners.push_back(ReadingCorners(box));
    crops.push_back(CropUpright(image, corners.back(), kRecogniserHeight));
  }

  // 3. Boxes whose text stands on its head are read the other way round.
  const std::vector<bool> upside_down = models_->classifier.UpsideDown(crops);
  for (std::size_t i = 0; i < crops.size(); ++i) {
    if (!upside_down[i])
      continue;
    corners[i] = TurnedHalfway(corners[i]);
    cv::rotate(crops[i], crops[i], cv::ROTATE_180);
  }

  const double classification_ms = stopwatch.Lap();

  // 4. The text of each box; misreadings (low confidence, nothing read) go.
  std::vector<TextLine> words;
  const std::vector<Reading> readings =
      options_.recognise ? models_->recogniser.Read(crops) : std::vector<Reading>(crops.size());
  for (std::size_t i = 0; i < crops.size(); ++i) {
    TextLine word;
    word.corners = corners[i];
    word.rect = RectFromCorners(corners[i]);
    if (options_.recognise) {
      const Decoded& decoded = readings[i].decoded;
      if (decoded.text.empty() || decoded.confidence < options_.min_confidence)
        continue;
      word.text = decoded.text;
      word.confidence = decoded.confidence;
      if (options_.character_boxes)
        word.characters = CharacterBoxes(readings[i], corners[i]);
    }
    words.push_back(std::move(word));
  }

  // 5. Boxes that continue one another make one line; lines in reading order.
  std::vector<TextLine> lines = GroupIntoLines(std::move(words));
  SortReadingOrder(lines);
  if (timings != nullptr)
    *timings = {detection_ms, classification_ms, stopwatch.Lap(), static_cast<int>(boxes.size())};
  return lines;
}

}  // namespace textreader

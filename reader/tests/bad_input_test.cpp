// What the reader says about input it cannot read and models it cannot load.
#include <filesystem>
#include <fstream>

#include <gtest/gtest.h>

#include "textreader/text_reader.h"

namespace textreader {
namespace {

namespace fs = std::filesystem;

ReaderOptions Options(const std::string& model_dir = TEXTREADER_MODEL_DIR) {
  ReaderOptions options;
  options.model_dir = model_dir;
  return options;
}

const TextReader& SharedReader() {
  static const TextReader reader(Options());
  return reader;
}

std::string MessageOf(const cv::Mat& image) {
  try {
    SharedReader().Read(image);
  } catch (const std::invalid_argument& e) {
    return e.what();
  }
  return "(no exception)";
}

TEST(BadInput, EmptyGreyAndSixteenBitImagesAreRefusedWithAClearMessage) {
  EXPECT_EQ(MessageOf(cv::Mat()), "text reader: the image is empty");
  EXPECT_EQ(MessageOf(cv::Mat(0, 10, CV_8UC3)), "text reader: the image is empty");
  EXPECT_EQ(MessageOf(cv::Mat(40, 40, CV_8UC1, cv::Scalar(0))),
            "text reader: the image must be 8-bit R G B or R G B A, not 8-bit with 1 channel(s)");
  EXPECT_EQ(MessageOf(cv::Mat(40, 40, CV_16UC3, cv::Scalar::all(0))),
            "text reader: the image must be 8-bit R G B or R G B A, not 16-bit with 3 channel(s)");
  EXPECT_EQ(MessageOf(cv::Mat(40, 40, CV_32FC4, cv::Scalar::all(0))),
            "text reader: the image must be 8-bit R G B or R G B A, not 32-bit with 4 channel(s)");
}

TEST(BadInput, TinyThinAndHugeImagesReadWithoutTrouble) {
  EXPECT_TRUE(SharedReader().Read(cv::Mat(1, 1, CV_8UC3, cv::Scalar::all(0))).empty());
  EXPECT_TRUE(SharedReader().Read(cv::Mat(1, 5000, CV_8UC4, cv::Scalar::all(0))).empty());
  EXPECT_TRUE(SharedReader().Read(cv::Mat(3000, 2, CV_8UC3, cv::Scalar::all(200))).empty());
  // 20000 x 20000: the detector sees it at its usual size, so the reader
  // needs little beyond the caller's 1.2 GB.
  const cv::Mat huge(20000, 20000, CV_8UC3, cv::Scalar(255, 255, 255));
  EXPECT_TRUE(SharedReader().Read(huge).empty());
}

TEST(BadInput, OptionsOutOfRangeAreRefused) {
  for (int side : {0, 31, 4097}) {
    ReaderOptions options = Options();
    options.detection_long_side = side;
    EXPECT_THROW(TextReader{options}, std::invalid_argument) << side;
  }
  ReaderOptions options = Options();
  options.threads = -1;
  EXPECT_THROW(TextReader{options}, std::invalid_argument);
  options = Options();
  options.min_confidence = 1.5F;
  EXPECT_THROW(TextReader{options}, std::invalid_argument);
}

// A model folder of links to the installed models, one of them replaced.
class ModelFolder : public testing::Test {
 protected:
  void SetUp() override {
    dir_ =
        fs::temp_directory_path() /
        ("textreader_models_" + std::to_string(::testing::UnitTest::GetInstance()->random_seed()) +
         "_" + ::testing::UnitTest::GetInstance()->current_test_info()->name());
    fs::remove_all(dir_);
    fs::create_directories(dir_);
    for (const fs::directory_entry& entry : fs::directory_iterator(TEXTREADER_MODEL_DIR))
      fs::create_symlink(entry.path(), dir_ / entry.path().filename());
  }
  void TearDown() override { fs::remove_all(dir_); }

  // The ModelError's message of a reader on this folder.
  std::string LoadError(Script script = Script::kLatin) {
    ReaderOptions options = Options(dir_.string());
    options.script = script;
    try {
      TextReader reader(options);
    } catch (const ModelError& e) {
      return e.what();
    }
    return "(loaded)";
  }

  void Replace(const std::string& name, const std::string& content) {
    fs::remove(dir_ / name);
    std::ofstream(dir_ / name, std::ios::binary) << content;
  }

  fs::path dir_;
};

TEST_F(ModelFolder, AMissingModelIsNamed) {
  const fs::path detector = dir_ / "ch_PP-OCRv4_det_infer.onnx";
  fs::remove(detector);
  EXPECT_EQ(LoadError(), "model file missing: " + detector.string());
  EXPECT_EQ(Options("/nonexistent").model_dir, "/nonexistent");
  EXPECT_THROW(TextReader{Options("/nonexistent")}, ModelError);
}

TEST_F(ModelFolder, ACorruptOrWrongModelIsNamed) {
  const std::string classifier = (dir_ / "ch_ppocr_mobile_v2.0_cls_infer.onnx").string();
  Replace("ch_ppocr_mobile_v2.0_cls_infer.onnx", "not a network at all");
  const std::string corrupt = LoadError();
  EXPECT_EQ(corrupt.rfind("model file does not load: " + classifier + ": ", 0), 0U) << corrupt;
  Replace("ch_ppocr_mobile_v2.0_cls_infer.onnx", "");
  EXPECT_EQ(LoadError().rfind("model file does not load: " + classifier, 0), 0U);
  // The Chinese recogniser where the English one belongs: its classes are
  // not the English alphabet.
  const std::string english = (dir_ / "en_PP-OCRv4_rec.onnx").string();
  fs::remove(dir_ / "ch_ppocr_mobile_v2.0_cls_infer.onnx");
  fs::create_symlink(fs::path(TEXTREADER_MODEL_DIR) / "ch_ppocr_mobile_v2.0_cls_infer.onnx",
                     dir_ / "ch_ppocr_mobile_v2.0_cls_infer.onnx");
  fs::remove(english);
  fs::create_symlink(fs::path(TEXTREADER_MODEL_DIR) / "ch_PP-OCRv4_rec_infer.onnx", english);
  EXPECT_EQ(LoadError(), "recogniser's classes do not match its alphabet of 97: " + english);
}

TEST_F(ModelFolder, AMissingOrEmptyDictionaryIsNamed) {
  const fs::path dictionary = dir_ / "ppocr_keys_v1.txt";
  fs::remove(dictionary);
  EXPECT_EQ(LoadError(Script::kChinese), "dictionary file missing: " + dictionary.string());
  Replace("ppocr_keys_v1.txt", "");
  EXPECT_EQ(LoadError(Script::kChinese), "dictionary file empty: " + dictionary.string());
}

}  // namespace
}  // namespace textreader

// Reads image files with the text reader and prints, per file, one JSON line:
// the file, the time taken and the lines read. For looking at what the reader
// reads and for scripts/textreader/quality.py, which scores it.
//   read_images [--long-side N] [--script latin|chinese] [--threads N]
//               [--min-confidence F] [--box-threshold F] [--min-width N]
//               [--models DIR] FILE...
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <iostream>
#include <string>
#include <vector>

#include <opencv2/imgcodecs.hpp>
#include <opencv2/imgproc.hpp>

#include "textreader/text_reader.h"

namespace {

std::string JsonString(const std::string& text) {
  std::string out = "\"";
  for (const char c : text) {
    if (c == '"' || c == '\\') {
      out += '\\';
      out += c;
    } else if (static_cast<unsigned char>(c) < 0x20) {
      char escaped[8];
      std::snprintf(escaped, sizeof escaped, "\\u%04x", c);
      out += escaped;
    } else {
      out += c;
    }
  }
  return out + "\"";
}

}  // namespace

int main(int argc, char** argv) {
  textreader::ReaderOptions options;
  options.model_dir = TEXTREADER_MODEL_DIR;
  std::vector<std::string> files;
  for (int i = 1; i < argc; ++i) {
    const std::string arg = argv[i];
    const bool has_value = i + 1 < argc;
    if (arg == "--long-side" && has_value)
      options.detection_long_side = std::atoi(argv[++i]);
    else if (arg == "--script" && has_value)
      options.script = std::string(argv[++i]) == "chinese" ? textreader::Script::kChinese
                                                           : textreader::Script::kLatin;
    else if (arg == "--threads" && has_value)
      options.threads = std::atoi(argv[++i]);
    else if (arg == "--min-confidence" && has_value)
      options.min_confidence = std::strtof(argv[++i], nullptr);
    else if (arg == "--box-threshold" && has_value)
      options.box_threshold = std::strtof(argv[++i], nullptr);
    else if (arg == "--min-width" && has_value)
      options.recognition_min_width = std::atoi(argv[++i]);
    else if (arg == "--models" && has_value)
      options.model_dir = argv[++i];
    else
      files.push_back(arg);
  }
  try {
    const textreader::TextReader reader(options);
    for (const std::string& file : files) {
      cv::Mat image = cv::imread(file, cv::IMREAD_COLOR);
      if (image.empty()) {
        std::cerr << "read_images: cannot read " << file << "\n";
        return 2;
      }
      cv::cvtColor(image, image, cv::COLOR_BGR2RGB);
      const auto start = std::chrono::steady_clock::now();
      const std::vector<textreader::TextLine> lines = reader.Read(image);
      const double ms =
          std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start)
              .count();
      std::cout << "{\"file\": " << JsonString(file) << ", \"ms\": " << ms << ", \"lines\": [";
      for (std::size_t i = 0; i < lines.size(); ++i) {
        const cv::RotatedRect& r = lines[i].rect;
        std::cout << (i ? ", " : "") << "{\"text\": " << JsonString(lines[i].text)
                  << ", \"confidence\": " << lines[i].confidence << ", \"rect\": [" << r.center.x
                  << ", " << r.center.y << ", " << r.size.width << ", " << r.size.height << ", "
                  << r.angle << "]}";
      }
      std::cout << "]}" << std::endl;
    }
  } catch (const std::exception& e) {
    std::cerr << "read_images: " << e.what() << "\n";
    return 1;
  }
  return 0;
}

// Measures the text reader per stage at 1280 x 720: a street photograph and
// a printed page (real images, scaled to fit and padded), with one intra-op
// thread and with the runtime's default; model loading once; peak memory.
//   reader_stages [street.jpg page.jpg [runs [recognition_min_width]]]
#include <sys/resource.h>
#include <time.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include <opencv2/imgcodecs.hpp>
#include <opencv2/imgproc.hpp>

#include "textreader/text_reader.h"

namespace {

using Clock = std::chrono::steady_clock;

// CPU time of the whole process (all its threads), which a loaded machine
// does not inflate as it does the wall time.
double CpuMs() {
  timespec now{};
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
  return now.tv_sec * 1e3 + now.tv_nsec / 1e6;
}

double Median(std::vector<double> values) {
  std::sort(values.begin(), values.end());
  return values.empty() ? 0.0 : values[values.size() / 2];
}

// The image scaled to fit 1280 x 720, centred on white: R G B.
cv::Mat At720p(const std::string& path) {
  cv::Mat image = cv::imread(path, cv::IMREAD_COLOR);
  if (image.empty()) {
    std::fprintf(stderr, "reader_stages: cannot read %s\n", path.c_str());
    std::exit(2);
  }
  const double scale = std::min(1280.0 / image.cols, 720.0 / image.rows);
  cv::resize(image, image, cv::Size(), scale, scale, scale < 1 ? cv::INTER_AREA : cv::INTER_CUBIC);
  cv::Mat frame(720, 1280, CV_8UC3, cv::Scalar::all(255));
  image.copyTo(
      frame(cv::Rect((1280 - image.cols) / 2, (720 - image.rows) / 2, image.cols, image.rows)));
  cv::cvtColor(frame, frame, cv::COLOR_BGR2RGB);
  return frame;
}

void Measure(const char* name, const cv::Mat& frame, int threads, int runs, int min_width) {
  textreader::ReaderOptions options;
  options.model_dir = TEXTREADER_MODEL_DIR;
  options.threads = threads;
  options.recognition_min_width = min_width;
  const auto load_start = Clock::now();
  const textreader::TextReader reader(options);
  const double load_ms =
      std::chrono::duration<double, std::milli>(Clock::now() - load_start).count();
  reader.Read(frame);  // the runtime's first run sets up its buffers
  std::vector<double> detection, classification, recognition, total, per_line, cpu;
  std::size_t lines = 0;
  int boxes = 0;
  for (int i = 0; i < runs; ++i) {
    textreader::ReadTimings t;
    const auto start = Clock::now();
    const double cpu_start = CpuMs();
    lines = reader.Read(frame, &t).size();
    cpu.push_back(CpuMs() - cpu_start);
    total.push_back(std::chrono::duration<double, std::milli>(Clock::now() - start).count());
    detection.push_back(t.detection_ms);
    classification.push_back(t.classification_ms);
    recognition.push_back(t.recognition_ms);
    per_line.push_back(t.boxes > 0 ? t.recognition_ms / t.boxes : 0.0);
    boxes = t.boxes;
  }
  std::printf(
      "%-7s threads %-7s load %6.0f ms | detection %6.1f  classification %6.1f  recognition "
      "%6.1f (%5.1f per box)  total %6.1f ms (CPU %6.1f) median of %d | %d boxes, %zu lines\n",
      name, threads == 0 ? "default" : std::to_string(threads).c_str(), load_ms, Median(detection),
      Median(classification), Median(recognition), Median(per_line), Median(total), Median(cpu),
      runs, boxes, lines);
}

}  // namespace

int main(int argc, char** argv) {
  const std::string data = std::string(TEXTREADER_SHARED_DATA);
  const std::string street = argc > 2 ? argv[1] : data + "/ic15ch4test_img_480.jpg";
  const std::string page = argc > 2 ? argv[2] : data + "/sroie_072.jpg";
  const int runs = argc > 3 ? std::max(1, std::atoi(argv[3])) : 10;
  const int min_width = argc > 4 ? std::atoi(argv[4]) : 320;
  const cv::Mat street_frame = At720p(street);
  const cv::Mat page_frame = At720p(page);
  for (const int threads : {1, 0}) {
    Measure("street", street_frame, threads, runs, min_width);
    Measure("page", page_frame, threads, runs, min_width);
  }
  rusage usage{};
  getrusage(RUSAGE_SELF, &usage);
  std::printf("peak resident memory %.0f MB\n", usage.ru_maxrss / 1024.0);
  return 0;
}

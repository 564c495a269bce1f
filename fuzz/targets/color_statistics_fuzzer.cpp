// The colour statistics request as its bridge makes it: the host's image
// (0..300 pixels a side, 1, 3 or 4 channels, 8-bit or float), any rectangle
// values, and output arrays of the right length or one off. OpenCV errors
// may leave the request; nothing else may.
#include <cstdint>
#include <cstdlib>
#include <vector>

#include <opencv2/core.hpp>

#include "inpainting/driver/color_statistics.h"
#include "support/fuzz_input.h"
#include "support/synthetic_image.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  ocr_fuzz::FuzzInput in(data, size);
  const int rows = in.Side(300);
  const int cols = in.Side(300);
  const int channels = in.Channels();
  const bool as_float = in.Byte() % 4 == 0;
  const std::vector<double> rect_values = in.Doubles(32);
  // Mostly the lengths the host computes; sometimes one more or one fewer.
  const std::size_t count = rect_values.size() / 5;
  const int skew = in.Byte() % 8;
  std::size_t means_length = count * static_cast<std::size_t>(channels);
  std::size_t std_devs_length = means_length;
  if (skew == 1)
    ++means_length;
  else if (skew == 2 && means_length > 0)
    --std_devs_length;
  cv::Mat image = ocr_fuzz::SyntheticImage(in, rows, cols, channels);
  if (as_float)
    image.convertTo(image, CV_32F, 1.0 / 255.0);

  // A sentinel shows whether a refused request wrote anything.
  constexpr double kUntouched = -12345.0;
  std::vector<double> means(means_length, kUntouched);
  std::vector<double> std_devs(std_devs_length, kUntouched);
  try {
    const int status = ocr_inpainting::CalculateRectMeansStdDevs(
        image, rect_values.data(), rect_values.size(), means.data(), means.size(), std_devs.data(),
        std_devs.size());
    if (status != 0) {
      for (double v : means)
        if (v != kUntouched)
          std::abort();
    }
  } catch (const cv::Exception&) {
  }
  return 0;
}

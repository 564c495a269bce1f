// The inpainting request as its bridge makes it, once the host's arrays are
// checked and copied: any image of 0..300 pixels a side with 1, 3 or 4
// channels, any number of rectangle values (including counts that are not
// multiples of five) and any values in them. OpenCV errors may leave the
// request; nothing else may, and a success must answer every rectangle.
#include <cstdint>
#include <cstdlib>
#include <vector>

#include <opencv2/core.hpp>

#include "inpainting/driver/inpainting_request.h"
#include "support/fuzz_input.h"
#include "support/synthetic_image.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  ocr_fuzz::FuzzInput in(data, size);
  const int rows = in.Side(300);
  const int cols = in.Side(300);
  const int channels = in.Channels();
  const std::vector<double> rect_values = in.Doubles(22);
  const cv::Mat image = ocr_fuzz::SyntheticImage(in, rows, cols, channels);

  // The bridge sizes the output list by the rectangle count and refuses
  // null output addresses, so every output is a live matrix.
  const int count = ocr_inpainting::RequestRectCount(rect_values.size());
  std::vector<cv::Mat> patches(static_cast<std::size_t>(count));
  std::vector<cv::Mat*> outputs;
  for (cv::Mat& patch : patches)
    outputs.push_back(&patch);
  std::vector<std::int32_t> packed_colors;
  try {
    const int status =
        ocr_inpainting::AnswerInpaintingRequest(image, rect_values, outputs, packed_colors);
    if (status == 0) {
      if (packed_colors.size() != patches.size())
        std::abort();
      for (std::size_t i = 0; i < patches.size(); ++i) {
        // Opaque colours and RGBA patches, as the renderer takes them.
        if ((static_cast<std::uint32_t>(packed_colors[i]) >> 24) != 0xFF)
          std::abort();
        if (!patches[i].empty() && patches[i].type() != CV_8UC4)
          std::abort();
      }
    }
  } catch (const cv::Exception&) {
  }
  return 0;
}

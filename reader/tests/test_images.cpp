#include "test_images.h"

#include <stdexcept>

#include <opencv2/imgcodecs.hpp>
#include <opencv2/imgproc.hpp>

namespace textreader_test {

cv::Mat RenderedText(const std::string& text, cv::Size size, cv::Point2f centre, double scale,
                     double angle) {
  cv::Mat page(size, CV_8UC3, cv::Scalar(235, 230, 220));
  const int thickness = std::max(1, static_cast<int>(scale * 2));
  int baseline = 0;
  const cv::Size extent =
      cv::getTextSize(text, cv::FONT_HERSHEY_SIMPLEX, scale, thickness, &baseline);
  const cv::Point origin(cvRound(centre.x - extent.width / 2.0),
                         cvRound(centre.y + extent.height / 2.0));
  cv::putText(page, text, origin, cv::FONT_HERSHEY_SIMPLEX, scale, cv::Scalar(20, 25, 30),
              thickness, cv::LINE_AA);
  // warpAffine turns by -angle in OpenCV's sense for a positive angle on a y
  // down page; the text's direction then points along (cos angle, sin angle).
  const cv::Mat turn = cv::getRotationMatrix2D(centre, -angle, 1.0);
  cv::Mat turned;
  cv::warpAffine(page, turned, turn, size, cv::INTER_LINEAR, cv::BORDER_CONSTANT,
                 cv::Scalar(235, 230, 220));
  return turned;
}

cv::Mat Photo(const std::string& name) {
  const std::string path = std::string(TEXTREADER_TEST_DATA) + "/" + name;
  cv::Mat image = cv::imread(path, cv::IMREAD_COLOR);
  if (image.empty())
    throw std::runtime_error("test photo missing: " + path);
  cv::cvtColor(image, image, cv::COLOR_BGR2RGB);
  return image;
}

}  // namespace textreader_test

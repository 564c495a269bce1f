// Images for the reader's tests: rendered text, and the real photographs
// kept beside the tests.
#ifndef TEXTREADER_TESTS_TEST_IMAGES_H_
#define TEXTREADER_TESTS_TEST_IMAGES_H_

#include <string>

#include <opencv2/core.hpp>

namespace textreader_test {

// Dark `text` on a light R G B page of `size`, centred at `centre`, `scale`
// times OpenCV's Hershey simplex, turned by `angle` degrees (y down: the
// reading direction points along (cos, sin)).
cv::Mat RenderedText(const std::string& text, cv::Size size, cv::Point2f centre, double scale,
                     double angle);

// A photograph from tests/data, as R G B.
cv::Mat Photo(const std::string& name);

}  // namespace textreader_test

#endif  // TEXTREADER_TESTS_TEST_IMAGES_H_

#include "otsu_telea_baseline.h"

#include <opencv2/imgproc.hpp>
#include <opencv2/photo.hpp>

namespace ocr_bench {

BaselineResult OtsuTeleaBaseline(const cv::Mat& frame, const std::vector<cv::RotatedRect>& rects) {
  BaselineResult result;
  result.frame = frame.clone();
  for (const cv::RotatedRect& rect : rects) {
    const cv::Rect roi = rect.boundingRect() & cv::Rect(0, 0, frame.cols, frame.rows);
    if (roi.width < 2 || roi.height < 2) {
      result.colors.emplace_back(0, 0, 0);
      continue;
    }
    cv::Point2f corners[4];
    rect.points(corners);
    std::vector<cv::Point> polygon;
    for (const cv::Point2f& corner : corners)
      polygon.emplace_back(cvRound(corner.x) - roi.x, cvRound(corner.y) - roi.y);
    cv::Mat inside = cv::Mat::zeros(roi.size(), CV_8UC1);
    cv::fillConvexPoly(inside, polygon, cv::Scalar(255));

    // Otsu over the pixels inside the rectangle only.
    const cv::Mat patch = frame(roi);
    cv::Mat grey;
    cv::cvtColor(patch, grey, cv::COLOR_RGB2GRAY);
    std::vector<uchar> values;
    for (int y = 0; y < grey.rows; ++y) {
      for (int x = 0; x < grey.cols; ++x) {
        if (inside.at<uchar>(y, x) != 0)
          values.push_back(grey.at<uchar>(y, x));
      }
    }
    cv::Mat ignored;
    const double level =
        cv::threshold(cv::Mat(values, false), ignored, 0, 255, cv::THRESH_BINARY | cv::THRESH_OTSU);
    cv::Mat text = (grey > level) & inside;
    if (cv::countNonZero(text) * 2 > cv::countNonZero(inside))
      text = (grey <= level) & inside;

    cv::Scalar color = cv::mean(patch, text);
    result.colors.push_back(color);

    cv::Mat grown;
    cv::dilate(text, grown, cv::Mat());
    cv::Mat filled;
    cv::inpaint(patch, grown, filled, 3.0, cv::INPAINT_TELEA);
    filled.copyTo(result.frame(roi), inside);
  }
  return result;
}

}  // namespace ocr_bench

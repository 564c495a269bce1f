#include "common/log.h"
#include "inpainting/analysis/binarization.h"

#include <vector>

#include <opencv2/core.hpp>
#include <opencv2/imgproc.hpp>

// The three binarisation methods and the gradient mask. The masks must match
// those of OpenCV 3.4; the calls used here behave the same in 4.6: the 8-bit
// RGB<->Lab conversions are the same bit-exact code, float RGB->Lab the same
// interpolated tables, CLAHE's 8-bit path (clip limit, tile padding,
// bilinear LUT blend) and PCA (covariance, Jacobi eigenvectors, mean
// subtraction) are unchanged. So nothing is adjusted here.
namespace ocr_inpainting {

void HLSThreshold(const cv::Mat& src, cv::Mat* dst) {
  cv::Mat hls;
  cv::cvtColor(src, hls, cv::COLOR_RGB2HLS);
  cv::Mat lightness;
  cv::extractChannel(hls, lightness, 1);
  cv::threshold(lightness, *dst, 0, 255, cv::THRESH_BINARY_INV | cv::THRESH_OTSU);
}

void BinarizationByClahe(const cv::Mat& src, cv::Mat* dst) {
  cv::Mat lab;
  cv::cvtColor(src, lab, cv::COLOR_RGB2Lab);
  std::vector<cv::Mat> planes;
  cv::split(lab, planes);
  // Created with 40 and lowered to 4 right away: the effective clip limit is
  // 4.0. Kept as two steps on purpose.
  cv::Ptr<cv::CLAHE> clahe = cv::createCLAHE(40.0, cv::Size(8, 8));
  clahe->setClipLimit(4.0);
  clahe->apply(planes[0], planes[0]);
  cv::merge(planes, lab);
  cv::Mat rgb;
  cv::cvtColor(lab, rgb, cv::COLOR_Lab2RGB);
  cv::Mat grey;
  cv::cvtColor(rgb, grey, cv::COLOR_RGB2GRAY);
  cv::threshold(grey, *dst, 0, 255, cv::THRESH_BINARY | cv::THRESH_OTSU);
}

void GetLabImage(const cv::Mat& src, cv::Mat* dst) {
  // Float RGB->Lab expects 0..1 input.
  src.convertTo(*dst, dst->type(), 0.00392156862745098, 0);
  cv::cvtColor(*dst, *dst, cv::COLOR_RGB2Lab);
}

void PCAThreshold(const cv::Mat& lab, cv::Mat* dst) {
  // One row per pixel needs a continuous matrix.
  const cv::Mat continuous = lab.isContinuous() ? lab : lab.clone();
  const cv::Mat data = continuous.reshape(1, continuous.rows * continuous.cols);
  cv::Mat mean;
  cv::Mat eigenvectors;
  cv::PCACompute(data, mean, eigenvectors, 1);
  cv::Mat projection;
  cv::PCAProject(data, mean, eigenvectors, projection);
  cv::normalize(projection, projection, 0, 1, cv::NORM_MINMAX, -1);
  cv::Mat u8;
  projection.reshape(1, continuous.rows).convertTo(u8, CV_8U, 255.0, 0);
  cv::threshold(u8, *dst, 0, 255, cv::THRESH_BINARY | cv::THRESH_OTSU);
}

void RGBSobel(const cv::Mat& src, cv::Mat* dst) {
  OCR_LOGI("Inpainting_Process: start RGB Sobel");
  cv::Mat blurred;
  cv::GaussianBlur(src, blurred, cv::Size(3, 3), 0, 0, cv::BORDER_DEFAULT);
  // 8-bit output on purpose: falling edges saturate to 0, so only edges
  // rising in +x and +y survive.
  cv::Mat gx;
  cv::Mat gy;
  cv::Sobel(blurred, gx, src.depth(), 1, 0, 3, 1.0, 0, cv::BORDER_DEFAULT);
  cv::Sobel(blurred, gy, src.depth(), 0, 1, 3, 1.0, 0, cv::BORDER_DEFAULT);
  cv::threshold(gx, gx, 0, 255, cv::THRESH_BINARY | cv::THRESH_OTSU);
  cv::threshold(gy, gy, 0, 255, cv::THRESH_BINARY | cv::THRESH_OTSU);
  cv::bitwise_or(gx, gy, *dst);
  OCR_LOGI("Inpainting_Process: finish RGB Sobel");
}

}  // namespace ocr_inpainting

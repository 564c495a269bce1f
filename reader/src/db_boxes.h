// Text boxes from the detector's probability map (the DB post-processing).
#ifndef TEXTREADER_DB_BOXES_H_
#define TEXTREADER_DB_BOXES_H_

#include <vector>

#include <opencv2/core.hpp>

namespace textreader {

struct DbParameters {
  float threshold = 0.3F;      // a pixel is text above this probability
  float box_threshold = 0.6F;  // a box is kept when its mean probability reaches this
  float unclip_ratio = 1.5F;   // see Unclip
  int max_candidates = 1000;   // regions looked at, largest first
};

// The boxes of text in image pixels (`image_size`), from `probability`
// (CV_32F, the detector's input size).
std::vector<cv::RotatedRect> BoxesFromMap(const cv::Mat& probability, const DbParameters& params,
                                          cv::Size image_size);

}  // namespace textreader

#endif  // TEXTREADER_DB_BOXES_H_

// The renderer bridge's per-frame work on the host's values: arrays of any
// length or absent, text counts past their ends, patch matrices of every
// layout, every display orientation and odd ones, backgrounds that do not
// fill the window, and any numbers in rectangles and colour corrections
// (NaN, infinities, huge). None of it may throw or trip a sanitizer.
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <vector>

#include <opencv2/core.hpp>

#include "renderer/frame_mapping.h"
#include "support/fuzz_input.h"

namespace {

using ocr_ar::HostArray;

// Patch matrices the host might hold: RGBA in one piece (the only layout
// drawn), empty, RGB, grey, float, and an RGBA view that is not in one piece.
const std::vector<cv::Mat>& PatchMats() {
  static const std::vector<cv::Mat> mats = [] {
    cv::Mat rgba(6, 9, CV_8UC4, cv::Scalar(10, 20, 30, 255));
    return std::vector<cv::Mat>{rgba,
                                cv::Mat(),
                                cv::Mat(5, 7, CV_8UC3, cv::Scalar::all(7)),
                                cv::Mat(3, 3, CV_8UC1, cv::Scalar::all(1)),
                                cv::Mat(4, 4, CV_32FC4, cv::Scalar::all(0.5)),
                                rgba(cv::Rect(1, 1, 4, 3))};
  }();
  return mats;
}

// Absent (null) or of a length the input picks; the storage outlives the view.
template <typename T, typename Fill>
HostArray<T> Array(ocr_fuzz::FuzzInput& in, std::vector<T>& storage, Fill fill) {
  const std::uint8_t length = in.Byte();
  if (length == 0xFF)
    return {};
  // A present array of length 0 still has an address, as a JVM gives it.
  storage.reserve(1);
  storage.resize(length % 41);
  for (T& value : storage)
    value = fill();
  return {storage.data(), storage.size()};
}

ocr_ar::CameraView View(ocr_fuzz::FuzzInput& in) {
  ocr_ar::CameraView view;
  if (in.Bool()) {
    // What the scene handler reports after fitting a background.
    const int window_w = in.Range(-2, 3000);
    const int window_h = in.Range(-2, 3000);
    const int bg_w = in.Range(-2, 3000);
    const int bg_h = in.Range(-2, 3000);
    view.camera_width = static_cast<float>(window_w);
    view.camera_height = static_cast<float>(window_h);
    view.bg_width = static_cast<float>(bg_w);
    view.bg_height = static_cast<float>(bg_h);
    view.corners = ocr_ar::FitBackground(window_w, window_h, bg_w, bg_h);
  } else {
    view.camera_width = static_cast<float>(in.Double());
    view.camera_height = static_cast<float>(in.Double());
    view.bg_width = static_cast<float>(in.Double());
    view.bg_height = static_cast<float>(in.Double());
    view.corners = {static_cast<float>(in.Double()), static_cast<float>(in.Double()),
                    static_cast<float>(in.Double()), static_cast<float>(in.Double())};
  }
  return view;
}

void CheckAngle(double angle) {
  const double normalized = ocr_ar::NormalizeDegrees(angle);
  if (std::isfinite(angle) ? !(normalized >= 0.0 && normalized < 360.0) : !std::isnan(normalized))
    std::abort();
  (void)ocr_ar::IsUpright(angle);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  ocr_fuzz::FuzzInput in(data, size);
  const std::vector<cv::Mat>& mats = PatchMats();
  auto number = [&in] { return in.Double(); };
  auto id = [&in] { return static_cast<std::int64_t>(in.U16()) << (in.Byte() % 48); };
  auto address = [&in, &mats]() -> std::int64_t {
    const std::uint8_t pick = in.Byte() % (mats.size() + 1);
    return pick == 0 ? 0
                     : static_cast<std::int64_t>(reinterpret_cast<std::uintptr_t>(&mats[pick - 1]));
  };
  auto colour = [&in] { return static_cast<std::int32_t>(in.U16() << 16 | in.U16()); };

  std::vector<double> patch_rects, text_rects, scales, shifts;
  std::vector<std::int64_t> ids, addrs;
  std::vector<std::int32_t> colours;
  ocr_ar::FrameArrays arrays;
  arrays.patch_rects = Array(in, patch_rects, number);
  arrays.text_rects = Array(in, text_rects, number);
  arrays.ids = Array(in, ids, id);
  arrays.patch_mat_addrs = Array(in, addrs, address);
  arrays.color_scales = Array(in, scales, number);
  arrays.color_shifts = Array(in, shifts, number);
  arrays.colors = Array(in, colours, colour);

  static constexpr int kOrientations[] = {0, 90, 180, 270, -90, 360, 45, 1 << 30};
  const int orientation = kOrientations[in.Byte() % 8];
  const ocr_ar::CameraView view = View(in);
  const std::size_t text_count = in.Byte() % 12;

  (void)ocr_ar::HasAllRects(arrays, text_count);
  for (std::size_t i = 0; i < text_count; ++i) {
    const ocr_ar::TextRecord record = in.Byte() % 16 == 0
                                          ? ocr_ar::UnreadableTextRecord()
                                          : ocr_ar::UnpackTextRecord(arrays, i, "text");
    // As the bridge draws one text.
    for (const ocr_ar::ImageRect& rect : {record.patch_rect, record.text_rect}) {
      const ocr_ar::ImageRect oriented =
          ocr_ar::OrientRect(rect, orientation, view.bg_width, view.bg_height);
      (void)ocr_ar::ToCameraRecord(oriented, view, ocr_ar::kPatchWidthMargin);
      CheckAngle(oriented.angle);
    }
    const ocr_ar::Color corrected =
        ocr_ar::CorrectColor(record.color, record.patch.color_scale, record.patch.color_shift);
    if (corrected.channel[3] != record.color.channel[3])
      std::abort();
  }
  CheckAngle(in.Double());
  // The camera frame into background bytes, for each layout the host has.
  cv::Mat scratch;
  (void)ocr_ar::BackgroundRgba(mats[in.Byte() % mats.size()], scratch);
  return 0;
}

#pragma once

// Values the host reads through com.quenda.tessel.Constants to shape the
// rectangles it sends; the library itself applies only the first and last.
namespace ocr_inpainting {

// Doubles per rotated rectangle in every rectangle array of the pipeline.
inline constexpr int kValsPerRect = 5;
// Host-side enlargement of an OCR box before it is sent for inpainting.
inline constexpr double kInpaintRectWidthRatio = 1.05;
inline constexpr double kInpaintRectHeightRatio = 1.15;
// Host-side enlargement of OCR boxes in percent: none.
inline constexpr double kStandardOcrEnlargePercent = 0.0;
// Smallest image side, in rows and columns, that the pipeline works on.
inline constexpr int kMinInpaintSize = 4;

}  // namespace ocr_inpainting

#include "quality/resolution/spectral_cutoff.h"

#include <algorithm>
#include <cmath>

namespace image_resolution {
namespace {

double MedianOf(std::vector<double> values) {
  const size_t half = values.size() / 2;
  std::nth_element(values.begin(), values.begin() + half, values.end());
  if (values.size() % 2 == 1)
    return values[half];
  const double upper = values[half];
  return (*std::max_element(values.begin(), values.begin() + half) + upper) / 2.0;
}

// log10 of the profile, averaged over a few neighbouring bins: a single ring's
// median still scatters by about ±1 dB.
std::vector<double> SmoothedLogProfile(const std::vector<float>& profile, int bins) {
  const int half_width = std::max(1, bins / 64);
  std::vector<double> log_power(bins + 1, 0.0);
  for (int bin = 1; bin <= bins; ++bin)
    log_power[bin] = std::log10(std::max(profile[bin], 1e-12f));
  std::vector<double> smoothed(bins + 1, 0.0);
  for (int bin = 1; bin <= bins; ++bin) {
    const int first = std::max(1, bin - half_width);
    const int last = std::min(bins, bin + half_width);
    double sum = 0.0;
    for (int i = first; i <= last; ++i)
      sum += log_power[i];
    smoothed[bin] = sum / (last - first + 1);
  }
  return smoothed;
}

}  // namespace

double WindowCutoff(const std::vector<float>& profile) {
  const int bins = static_cast<int>(profile.size()) - 1;
  if (bins < 8)
    return kNoDetail;
  const std::vector<double> log_power = SmoothedLogProfile(profile, bins);
  std::vector<double> log_whitened(bins + 1, 0.0);
  for (int bin = 1; bin <= bins; ++bin)
    log_whitened[bin] = log_power[bin] + 2.0 * std::log10(static_cast<double>(bin) / bins);

  // The lowest rings carry the taper's and the detrend's leakage; start at 3.
  const int band_low = std::max(3, static_cast<int>(std::lround(kCoarseBandLow * bins)));
  const int band_high =
      std::min(bins, std::max(band_low + 2, static_cast<int>(std::lround(kCoarseBandHigh * bins))));
  const auto band = [band_low, band_high](const std::vector<double>& values) {
    return std::vector<double>(values.begin() + band_low, values.begin() + band_high + 1);
  };
  const int fine_low = static_cast<int>(std::lround(kFineBandLow * bins));
  const double log_fine_level =
      MedianOf(std::vector<double>(log_power.begin() + fine_low, log_power.end()));
  const double log_margin = std::log10(kNoiseFloorMargin);
  const double log_floor = std::log10(kRoundingNoiseMedian) + log_margin;
  if (MedianOf(band(log_power)) < std::max(log_floor, log_fine_level + log_margin))
    return kNoDetail;

  const double log_drop = std::log10(kWhitenedDrop);
  double log_peak = MedianOf(band(log_whitened));
  // How far a bin stands above both limits (log10 units); negative = no detail.
  auto margin = [&](int bin) {
    return std::min(log_whitened[bin] - (log_peak + log_drop), log_power[bin] - log_floor);
  };
  double previous = margin(band_low);
  if (previous < 0.0)
    return static_cast<double>(band_low) / bins;
  for (int bin = band_low + 1; bin <= bins; ++bin) {
    log_peak = std::max(log_peak, log_whitened[bin]);
    const double current = margin(bin);
    if (current < 0.0) {
      const double fraction = previous / (previous - current);
      return (bin - 1 + fraction) / bins;
    }
    previous = current;
  }
  return 1.0;
}

double CombineWindowCutoffs(const std::array<double, kWindowCount>& cutoffs) {
  std::vector<double> with_detail;
  for (double cutoff : cutoffs) {
    if (cutoff > kNoDetail)
      with_detail.push_back(cutoff);
  }
  return with_detail.empty() ? kNoDetail : MedianOf(with_detail);
}

}  // namespace image_resolution

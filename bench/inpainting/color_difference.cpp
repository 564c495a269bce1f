#include "color_difference.h"

#include <algorithm>
#include <cmath>

namespace ocr_bench {
namespace {

double Linear(double encoded) {
  const double c = std::clamp(encoded, 0.0, 255.0) / 255.0;
  return c <= 0.04045 ? c / 12.92 : std::pow((c + 0.055) / 1.055, 2.4);
}

double LabF(double t) {
  constexpr double kDelta = 6.0 / 29.0;
  return t > kDelta * kDelta * kDelta ? std::cbrt(t) : t / (3 * kDelta * kDelta) + 4.0 / 29.0;
}

double Degrees(double radians) {
  return radians * 180.0 / CV_PI;
}
double Radians(double degrees) {
  return degrees * CV_PI / 180.0;
}

}  // namespace

cv::Vec3d SrgbToLab(const cv::Scalar& rgb) {
  const double r = Linear(rgb[0]);
  const double g = Linear(rgb[1]);
  const double b = Linear(rgb[2]);
  const double x = 0.4124564 * r + 0.3575761 * g + 0.1804375 * b;
  const double y = 0.2126729 * r + 0.7151522 * g + 0.0721750 * b;
  const double z = 0.0193339 * r + 0.1191920 * g + 0.9503041 * b;
  const double fx = LabF(x / 0.95047);
  const double fy = LabF(y / 1.0);
  const double fz = LabF(z / 1.08883);
  return {116 * fy - 16, 500 * (fx - fy), 200 * (fy - fz)};
}

double Ciede2000(const cv::Vec3d& lab1, const cv::Vec3d& lab2) {
  const double c1 = std::hypot(lab1[1], lab1[2]);
  const double c2 = std::hypot(lab2[1], lab2[2]);
  const double c_mean = (c1 + c2) / 2;
  const double c_mean7 = std::pow(c_mean, 7);
  const double g = 0.5 * (1 - std::sqrt(c_mean7 / (c_mean7 + std::pow(25.0, 7))));
  const double a1 = (1 + g) * lab1[1];
  const double a2 = (1 + g) * lab2[1];
  const double cp1 = std::hypot(a1, lab1[2]);
  const double cp2 = std::hypot(a2, lab2[2]);
  auto hue = [](double b, double a) {
    if (a == 0 && b == 0)
      return 0.0;
    const double h = Degrees(std::atan2(b, a));
    return h < 0 ? h + 360 : h;
  };
  const double hp1 = hue(lab1[2], a1);
  const double hp2 = hue(lab2[2], a2);

  const double dl = lab2[0] - lab1[0];
  const double dc = cp2 - cp1;
  double dh = 0;
  if (cp1 * cp2 != 0) {
    dh = hp2 - hp1;
    if (dh > 180)
      dh -= 360;
    else if (dh < -180)
      dh += 360;
  }
  const double dH = 2 * std::sqrt(cp1 * cp2) * std::sin(Radians(dh / 2));

  const double l_mean = (lab1[0] + lab2[0]) / 2;
  const double cp_mean = (cp1 + cp2) / 2;
  double hp_mean = hp1 + hp2;
  if (cp1 * cp2 != 0) {
    if (std::abs(hp1 - hp2) <= 180)
      hp_mean /= 2;
    else
      hp_mean = hp1 + hp2 < 360 ? (hp1 + hp2 + 360) / 2 : (hp1 + hp2 - 360) / 2;
  }
  const double t =
      1 - 0.17 * std::cos(Radians(hp_mean - 30)) + 0.24 * std::cos(Radians(2 * hp_mean)) +
      0.32 * std::cos(Radians(3 * hp_mean + 6)) - 0.20 * std::cos(Radians(4 * hp_mean - 63));
  const double d_theta = 30 * std::exp(-std::pow((hp_mean - 275) / 25, 2));
  const double cp_mean7 = std::pow(cp_mean, 7);
  const double rc = 2 * std::sqrt(cp_mean7 / (cp_mean7 + std::pow(25.0, 7)));
  const double sl = 1 + 0.015 * std::pow(l_mean - 50, 2) / std::sqrt(20 + std::pow(l_mean - 50, 2));
  const double sc = 1 + 0.045 * cp_mean;
  const double sh = 1 + 0.015 * cp_mean * t;
  const double rt = -std::sin(Radians(2 * d_theta)) * rc;
  const double tl = dl / sl;
  const double tc = dc / sc;
  const double th = dH / sh;
  return std::sqrt(tl * tl + tc * tc + th * th + rt * tc * th);
}

}  // namespace ocr_bench

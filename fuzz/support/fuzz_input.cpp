#include "support/fuzz_input.h"

#include <cstring>
#include <iterator>
#include <limits>

namespace ocr_fuzz {
namespace {

constexpr double kSpecial[] = {
    0.0,
    -0.0,
    1.0,
    -1.0,
    std::numeric_limits<double>::quiet_NaN(),
    std::numeric_limits<double>::infinity(),
    -std::numeric_limits<double>::infinity(),
    1e300,
    -1e300,
    3.5e38,  // past float's range: becomes infinity when narrowed
    -3.5e38,
    2147483648.0,  // one past int's range
    -2147483649.0,
    1e-320,  // subnormal
    std::numeric_limits<float>::max(),
    1e9,
};

}  // namespace

double FuzzInput::Double() {
  const std::uint8_t tag = Byte();
  if (tag < std::size(kSpecial))
    return kSpecial[tag];
  if (tag < 200)
    return static_cast<int>(U16() % 4097 - 2048) / 4.0;
  double raw = 0.0;
  std::uint8_t bytes[sizeof raw];
  for (std::uint8_t& b : bytes)
    b = Byte();
  std::memcpy(&raw, bytes, sizeof raw);
  return raw;
}

std::string FuzzInput::Rest() {
  std::string rest(reinterpret_cast<const char*>(data_ + pos_), size_ - pos_);
  pos_ = size_;
  return rest;
}

}  // namespace ocr_fuzz

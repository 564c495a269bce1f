#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

// Reads a fuzzer's input as a stream of small decisions. Past the end every
// read yields zero, so any prefix of an input is itself a valid input.
namespace ocr_fuzz {

class FuzzInput {
 public:
  FuzzInput(const std::uint8_t* data, std::size_t size) : data_(data), size_(size) {}

  std::size_t remaining() const { return size_ - pos_; }

  std::uint8_t Byte() { return pos_ < size_ ? data_[pos_++] : 0; }
  std::uint16_t U16() {
    const std::uint16_t high = Byte();
    return static_cast<std::uint16_t>(high << 8 | Byte());
  }
  bool Bool() { return (Byte() & 1) != 0; }
  // Uniform enough in [lo, hi] for lo <= hi and a span below 65536.
  int Range(int lo, int hi) { return lo + static_cast<int>(U16() % (hi - lo + 1)); }

  // An image side in 0..max: mostly below 64 from one byte, which keeps most
  // runs cheap, else anywhere in the range.
  int Side(int max) {
    const std::uint8_t small = Byte();
    return small < 192 ? small % 64 : Range(0, max);
  }

  // A value as a host might send it: usually a moderate number of pixels or
  // degrees (quarter steps in -512..512), sometimes one of the troublesome
  // values (NaN, infinities, huge, tiny, signed zero, past float range), and
  // sometimes eight raw bytes.
  double Double();

  // 0..max_count values read by Double(), the count from one byte: the flat
  // five-per-rectangle arrays of the host, counts off by any amount included.
  std::vector<double> Doubles(std::size_t max_count) {
    std::vector<double> values(Byte() % (max_count + 1));
    for (double& value : values)
      value = Double();
    return values;
  }

  // The channel count of a host image: 3 most often, else 1 or 4.
  int Channels() {
    static constexpr int kChannels[] = {3, 1, 4};
    return kChannels[Byte() % 3];
  }

  // The rest of the input as a string of bytes.
  std::string Rest();

 private:
  const std::uint8_t* data_;
  std::size_t size_;
  std::size_t pos_ = 0;
};

}  // namespace ocr_fuzz

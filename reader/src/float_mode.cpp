#include "float_mode.h"

#if defined(__x86_64__) || defined(__i386__)
#include <xmmintrin.h>
#endif

namespace textreader {
namespace {

#if defined(__x86_64__) || defined(__i386__)
// MXCSR: flush-to-zero (results) and denormals-are-zero (inputs).
constexpr std::uint64_t kFlushBits = 0x8000 | 0x0040;
std::uint64_t ReadMode() {
  return _mm_getcsr();
}
void WriteMode(std::uint64_t mode) {
  _mm_setcsr(static_cast<unsigned int>(mode));
}
#elif defined(__aarch64__)
// FPCR's FZ bit flushes both inputs and results.
constexpr std::uint64_t kFlushBits = std::uint64_t{1} << 24;
std::uint64_t ReadMode() {
  std::uint64_t mode = 0;
  asm volatile("mrs %0, fpcr" : "=r"(mode));
  return mode;
}
void WriteMode(std::uint64_t mode) {
  asm volatile("msr fpcr, %0" : : "r"(mode));
}
#else
// Elsewhere denormals keep their default handling.
constexpr std::uint64_t kFlushBits = 0;
std::uint64_t ReadMode() {
  return 0;
}
void WriteMode(std::uint64_t) {}
#endif

}  // namespace

KeepFloatMode::KeepFloatMode() : saved_(ReadMode()) {}

KeepFloatMode::~KeepFloatMode() {
  WriteMode(saved_);
}

FlushDenormals::FlushDenormals() {
  if (kFlushBits != 0)
    WriteMode(ReadMode() | kFlushBits);
}

}  // namespace textreader

// The calling thread's handling of denormal floats, set for a scope.
//
// Denormals (magnitudes under about 1e-38) take the CPU's slow path, many
// times slower than normal floats. The English recogniser's activations fall
// there often enough to make it three to four times slower; flushed to zero
// they change none of its readings. The mode is the thread's, and the thread
// is the caller's (a JVM thread, say): it is restored when the scope ends.
#ifndef TEXTREADER_FLOAT_MODE_H_
#define TEXTREADER_FLOAT_MODE_H_

#include <cstdint>

namespace textreader {

// Restores the thread's float mode when it goes out of scope.
class KeepFloatMode {
 public:
  KeepFloatMode();
  ~KeepFloatMode();
  KeepFloatMode(const KeepFloatMode&) = delete;
  KeepFloatMode& operator=(const KeepFloatMode&) = delete;

 private:
  std::uint64_t saved_;
};

// Flushes denormal results and inputs to zero on this thread for its scope.
class FlushDenormals {
 public:
  FlushDenormals();

 private:
  KeepFloatMode keep_;
};

}  // namespace textreader

#endif  // TEXTREADER_FLOAT_MODE_H_

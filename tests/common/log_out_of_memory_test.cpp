// A log line must never end the process: bridge functions print outside any
// guard and catch handlers print while handling a failure, so running out of
// memory while formatting a message drops that message and nothing else.
// This binary replaces the global allocator so that a test can make it fail.
#include <gtest/gtest.h>

#include <cstdlib>
#include <new>
#include <string>

#include "common/log.h"

namespace {
thread_local bool t_refuse_allocations = false;
}  // namespace

void* operator new(std::size_t size) {
  if (t_refuse_allocations)
    throw std::bad_alloc();
  if (void* memory = std::malloc(size > 0 ? size : 1))
    return memory;
  throw std::bad_alloc();
}

// GCC cannot see that the memory freed here came from the malloc above.
#pragma GCC diagnostic ignored "-Wmismatched-new-delete"

void operator delete(void* memory) noexcept {
  std::free(memory);
}

void operator delete(void* memory, std::size_t) noexcept {
  std::free(memory);
}

namespace {

// While it lives, every allocation on this thread fails.
class RefusedAllocations {
 public:
  RefusedAllocations() { t_refuse_allocations = true; }
  ~RefusedAllocations() { t_refuse_allocations = false; }
};

TEST(LogOutOfMemory, AMessageThatFindsNoMemoryIsDroppedAndTheCallerGoesOn) {
  ocr::log::ScopedCapture capture;
  // Longer than the formatter's stack buffer, so formatting must allocate.
  const std::string long_text(2000, 'x');
  {
    RefusedAllocations refused;
    EXPECT_NO_THROW(OCR_LOGE("Vexel: initFromSurface() ERROR: %s", long_text.c_str()));
    EXPECT_NO_THROW(OCR_LOGI("Vexel: shutDown renderer."));
  }
  OCR_LOGI("Vexel: Set renderer orientation %d.", 90);
  EXPECT_EQ(capture.Texts(), std::vector<std::string>{"Vexel: Set renderer orientation 90."});
}

}  // namespace

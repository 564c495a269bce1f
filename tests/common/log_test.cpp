#include "common/log.h"

#include <gtest/gtest.h>

#include <string>
#include <thread>
#include <vector>

#include "common/nanotime.h"

namespace {

TEST(Log, CaptureSeesFormattedTextAndPriority) {
  ocr::log::ScopedCapture capture;
  OCR_LOGW("OcrTracker::UpdateTracker Failure: Too few points tracked: %d/%d", 3, 40);
  OCR_LOGD("trailing blank kept ");
  ASSERT_EQ(capture.Records().size(), 2u);
  EXPECT_EQ(capture.Records()[0].priority, ocr::log::kWarn);
  EXPECT_TRUE(capture.Contains("OcrTracker::UpdateTracker Failure: Too few points tracked: 3/40",
                               ocr::log::kWarn));
  EXPECT_FALSE(capture.Contains("trailing blank kept"));
  EXPECT_TRUE(capture.Contains("trailing blank kept ", ocr::log::kDebug));
}

TEST(Log, MessagesLongerThanTheStackBufferArriveWhole) {
  ocr::log::ScopedCapture capture;
  const std::string long_text(3000, 'x');
  OCR_LOGE("%s|end", long_text.c_str());
  EXPECT_TRUE(capture.Contains(long_text + "|end", ocr::log::kError));
}

TEST(Log, CaptureCollectsFromManyThreadsAndStopsWhenDestroyed) {
  std::vector<std::thread> threads;
  {
    ocr::log::ScopedCapture capture;
    for (int t = 0; t < 4; ++t) {
      threads.emplace_back([] {
        for (int i = 0; i < 100; ++i)
          OCR_LOGD("worker message");
      });
    }
    for (auto& thread : threads)
      thread.join();
    EXPECT_EQ(capture.Count("worker message", ocr::log::kDebug), 400);
  }
  ocr::log::ScopedCapture later;
  OCR_LOGI("after");
  EXPECT_EQ(later.Texts(), std::vector<std::string>{"after"});
}

TEST(NanoTime, IsWallClockNanoseconds) {
  const uint64_t first = get_nanotime();
  const uint64_t second = get_nanotime();
  EXPECT_LE(first, second);
  // Later than 2020-01-01 in nanoseconds since the epoch.
  EXPECT_GT(first, 1577836800ULL * 1000000000ULL);
}

}  // namespace

#include "common/log.h"

#include <algorithm>
#include <cstdarg>
#include <cstdio>
#include <mutex>

#include "platform/log_sink.h"

namespace ocr::log {
namespace {

std::mutex& CapturesMutex() {
  static std::mutex mutex;
  return mutex;
}

std::vector<ScopedCapture*>& ActiveCaptures() {
  static std::vector<ScopedCapture*> captures;
  return captures;
}

std::string FormatMessage(const char* format, va_list args) {
  char small[512];
  va_list copy;
  va_copy(copy, args);
  const int length = std::vsnprintf(small, sizeof(small), format, copy);
  va_end(copy);
  if (length < 0)
    return std::string(format);
  if (static_cast<size_t>(length) < sizeof(small))
    return std::string(small, length);
  std::string large(static_cast<size_t>(length) + 1, '\0');
  std::vsnprintf(large.data(), large.size(), format, args);
  large.resize(static_cast<size_t>(length));
  return large;
}

}  // namespace

void Print(int priority, const char* format, ...) noexcept {
  va_list args;
  va_start(args, format);
  try {
    const std::string text = FormatMessage(format, args);
    platform::WriteLog(priority, kTag, text.c_str());
    std::lock_guard<std::mutex> lock(CapturesMutex());
    for (ScopedCapture* capture : ActiveCaptures())
      capture->Append(priority, text);
  } catch (...) {
    // Out of memory (or a lock that failed): the message is lost, the caller
    // goes on.
  }
  va_end(args);
}

struct ScopedCapture::State {
  mutable std::mutex mutex;
  std::vector<Record> records;
};

ScopedCapture::ScopedCapture() : state_(new State) {
  std::lock_guard<std::mutex> lock(CapturesMutex());
  ActiveCaptures().push_back(this);
}

ScopedCapture::~ScopedCapture() {
  {
    std::lock_guard<std::mutex> lock(CapturesMutex());
    auto& captures = ActiveCaptures();
    captures.erase(std::remove(captures.begin(), captures.end(), this), captures.end());
  }
  delete state_;
}

void ScopedCapture::Append(int priority, const std::string& text) {
  std::lock_guard<std::mutex> lock(state_->mutex);
  state_->records.push_back({priority, text});
}

std::vector<Record> ScopedCapture::Records() const {
  std::lock_guard<std::mutex> lock(state_->mutex);
  return state_->records;
}

std::vector<std::string> ScopedCapture::Texts() const {
  std::vector<std::string> texts;
  for (const Record& record : Records())
    texts.push_back(record.text);
  return texts;
}

int ScopedCapture::Count(const std::string& text, int priority) const {
  std::lock_guard<std::mutex> lock(state_->mutex);
  return static_cast<int>(
      std::count_if(state_->records.begin(), state_->records.end(), [&](const Record& record) {
        return record.text == text && (priority < 0 || record.priority == priority);
      }));
}

void ScopedCapture::Clear() {
  std::lock_guard<std::mutex> lock(state_->mutex);
  state_->records.clear();
}

}  // namespace ocr::log

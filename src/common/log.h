#pragma once

#include <string>
#include <vector>

// The engine's one logging facility: printf-style messages under the tag
// "OCRAR-Native", at the Android priorities below.
namespace ocr::log {

inline constexpr const char* kTag = "OCRAR-Native";

enum Priority : int {
  kDebug = 3,
  kInfo = 4,
  kWarn = 5,
  kError = 6,
};

// Never throws: a message that cannot be formatted or stored for lack of
// memory is dropped, so that a log line can stand anywhere, also in a catch
// handler or a bridge function outside any guard.
void Print(int priority, const char* format, ...) noexcept __attribute__((format(printf, 2, 3)));

// One formatted message as it reached the log.
struct Record {
  int priority;
  std::string text;
};

// Collects, while it lives, every message printed by any thread (in addition
// to the normal log). Meant for tests that assert exact message texts.
class ScopedCapture {
 public:
  ScopedCapture();
  ~ScopedCapture();
  ScopedCapture(const ScopedCapture&) = delete;
  ScopedCapture& operator=(const ScopedCapture&) = delete;

  std::vector<Record> Records() const;
  std::vector<std::string> Texts() const;
  // Number of messages with exactly this text (and priority, when given).
  int Count(const std::string& text, int priority = -1) const;
  bool Contains(const std::string& text, int priority = -1) const {
    return Count(text, priority) > 0;
  }
  void Clear();

  // Called by Print for every active capture.
  void Append(int priority, const std::string& text);

 private:
  struct State;
  State* state_;
};

}  // namespace ocr::log

#define OCR_LOGD(...) ::ocr::log::Print(::ocr::log::kDebug, __VA_ARGS__)
#define OCR_LOGI(...) ::ocr::log::Print(::ocr::log::kInfo, __VA_ARGS__)
#define OCR_LOGW(...) ::ocr::log::Print(::ocr::log::kWarn, __VA_ARGS__)
#define OCR_LOGE(...) ::ocr::log::Print(::ocr::log::kError, __VA_ARGS__)

#include "log.h"

#include <chrono>

#include "platform/kit_files.h"

namespace Vexel::internal {
namespace {

char LevelLetter(KitLog::Level level) {
  switch (level) {
    case KitLog::kDebug:
      return 'D';
    case KitLog::kInfo:
      return 'I';
    case KitLog::kWarning:
      return 'W';
    case KitLog::kError:
      return 'E';
  }
  return '?';
}

}  // namespace

KitLog::KitLog(const std::string& name) : path_(platform::KitLogPath(name)) {
  if (!path_.empty()) {
    file_ = std::fopen(path_.c_str(), "a");
    if (file_ == nullptr) {
      platform::KitSystemLog(kWarning, "Vexel: cannot write the log file " + path_);
      path_.clear();
    }
  }
}

KitLog::~KitLog() {
  if (file_ != nullptr)
    std::fclose(file_);
}

void KitLog::Write(Level level, const std::string& text) {
  platform::KitSystemLog(level, text);
  if (file_ == nullptr)
    return;
  const auto now = std::chrono::system_clock::now().time_since_epoch();
  const auto micros = std::chrono::duration_cast<std::chrono::microseconds>(now).count();
  std::lock_guard<std::mutex> lock(mutex_);
  std::fprintf(file_, "%lld.%06lld %c %s\n", static_cast<long long>(micros / 1000000),
               static_cast<long long>(micros % 1000000), LevelLetter(level), text.c_str());
  std::fflush(file_);
}

}  // namespace Vexel::internal

#pragma once

#include <cstdio>
#include <mutex>
#include <string>

namespace Vexel::internal {

// The kit's own log: every message to its file (when it has one), warnings
// and errors also to the platform's log.
class KitLog {
 public:
  enum Level { kDebug = 3, kInfo = 4, kWarning = 5, kError = 6 };

  // `name` as given to the Kit; see platform::KitLogPath for where it goes.
  explicit KitLog(const std::string& name);
  ~KitLog();
  KitLog(const KitLog&) = delete;
  KitLog& operator=(const KitLog&) = delete;

  void Write(Level level, const std::string& text);
  const std::string& path() const { return path_; }

 private:
  std::string path_;
  std::FILE* file_ = nullptr;
  std::mutex mutex_;
};

}  // namespace Vexel::internal

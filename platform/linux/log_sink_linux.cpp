#include "platform/log_sink.h"

#include <cstdio>
#include <cstdlib>
#include <mutex>

namespace platform {
namespace {

char PriorityLetter(int priority) {
  switch (priority) {
    case 2:
      return 'V';
    case 3:
      return 'D';
    case 4:
      return 'I';
    case 5:
      return 'W';
    case 6:
      return 'E';
    case 7:
      return 'F';
    default:
      return '?';
  }
}

// Messages below this priority stay off standard error (the file still gets
// them): the engine logs at debug level on every frame, like on a phone.
int StderrMinimumPriority() {
  static const int minimum = [] {
    const char* value = std::getenv("OCRAR_LOG_LEVEL");
    return value != nullptr ? std::atoi(value) : 4;
  }();
  return minimum;
}

struct LogFile {
  std::mutex mutex;
  std::FILE* file = nullptr;

  LogFile() {
    const char* path = std::getenv("OCRAR_LOG_FILE");
    if (path != nullptr && path[0] != '\0')
      file = std::fopen(path, "a");
  }
  ~LogFile() {
    if (file != nullptr)
      std::fclose(file);
  }
};

LogFile& SharedLogFile() {
  static LogFile log_file;
  return log_file;
}

}  // namespace

void WriteLog(int priority, const char* tag, const char* text) {
  const char letter = PriorityLetter(priority);
  if (priority >= StderrMinimumPriority()) {
    std::fprintf(stderr, "%c/%s: %s\n", letter, tag, text);
  }
  LogFile& log_file = SharedLogFile();
  if (log_file.file == nullptr)
    return;
  std::lock_guard<std::mutex> lock(log_file.mutex);
  std::fprintf(log_file.file, "%c/%s: %s\n", letter, tag, text);
  std::fflush(log_file.file);
}

}  // namespace platform

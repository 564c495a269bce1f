#include "platform/log_sink.h"

#include <android/log.h>

namespace platform {

void WriteLog(int priority, const char* tag, const char* text) {
  __android_log_write(priority, tag, text);
}

}  // namespace platform

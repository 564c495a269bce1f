#pragma once

namespace platform {

// Writes one finished log message. `priority` uses the Android numbering
// (3 debug, 4 info, 5 warning, 6 error). On Android this is the system log;
// on Linux one line on standard error, and every line also in the file named
// by OCRAR_LOG_FILE when that variable is set.
void WriteLog(int priority, const char* tag, const char* text);

}  // namespace platform

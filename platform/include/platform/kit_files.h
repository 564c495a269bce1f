#pragma once

#include <string>

// Files the scene kit finds in platform-specific places: its log and the
// platform's fonts.
namespace platform {

// The path for the kit's log file `name`, its directory created; empty when
// no file is to be written. An absolute name stands as it is. Otherwise:
// Linux: $VEXEL_LOG_DIR, else $XDG_STATE_HOME/vexel, else the temporary
// directory's "vexel"; Android: $VEXEL_LOG_DIR, else no file.
std::string KitLogPath(const std::string& name);

// One kit message to the platform's own log: the system log (tag "Vexel") on
// a phone; on Linux, warnings and errors only, through the engine's sink.
void KitSystemLog(int priority, const std::string& text);

// The path of a platform font given by file name, empty when there is none:
// /system/fonts on a phone; on Linux the font directories under
// /usr/share/fonts and /usr/local/share/fonts, searched recursively.
std::string FindSystemFont(const std::string& file_name);
// Where FindSystemFont looks, for messages.
std::string SystemFontLocation();

}  // namespace platform

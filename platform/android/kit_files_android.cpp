#include <android/log.h>

#include <cstdlib>
#include <filesystem>
#include <system_error>

#include "kit_log_directory.h"
#include "platform/kit_files.h"

namespace platform {

std::filesystem::path KitLogDirectory() {
  // An app's writable directories are known only to its Java side, which can
  // name one through this variable before the kit starts.
  const char* dir = std::getenv("VEXEL_LOG_DIR");
  if (dir == nullptr || dir[0] == '\0')
    return {};
  return dir;
}

void KitSystemLog(int priority, const std::string& text) {
  __android_log_write(priority, "Vexel", text.c_str());
}

std::string FindSystemFont(const std::string& file_name) {
  if (file_name.empty() || file_name.find('/') != std::string::npos)
    return {};
  const std::filesystem::path path = std::filesystem::path("/system/fonts") / file_name;
  std::error_code error;
  return std::filesystem::is_regular_file(path, error) ? path.string() : std::string();
}

std::string SystemFontLocation() {
  return "/system/fonts";
}

}  // namespace platform

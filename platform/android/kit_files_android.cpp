#include <android/log.h>

#include <cstdlib>
#include <filesystem>
#include <system_error>

#include "platform/kit_files.h"

namespace platform {

std::string KitLogPath(const std::string& name) {
  if (name.empty())
    return {};
  const std::filesystem::path file(name);
  if (file.is_absolute())
    return name;
  // An app's writable directories are known only to its Java side, which can
  // name one through this variable before the kit starts.
  const char* dir = std::getenv("VEXEL_LOG_DIR");
  if (dir == nullptr || dir[0] == '\0')
    return {};
  std::error_code error;
  std::filesystem::create_directories(dir, error);
  if (error)
    return {};
  return (std::filesystem::path(dir) / file).string();
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

#include <cstdlib>
#include <filesystem>
#include <system_error>

#include "kit_log_directory.h"
#include "platform/kit_files.h"
#include "platform/log_sink.h"

namespace platform {
namespace {

std::string Environment(const char* name) {
  const char* value = std::getenv(name);
  return value != nullptr ? value : "";
}

const char* const kFontRoots[] = {"/usr/share/fonts", "/usr/local/share/fonts"};

}  // namespace

std::filesystem::path KitLogDirectory() {
  if (const std::string dir = Environment("VEXEL_LOG_DIR"); !dir.empty())
    return dir;
  if (const std::string state = Environment("XDG_STATE_HOME"); !state.empty())
    return std::filesystem::path(state) / "vexel";
  std::error_code error;
  std::filesystem::path temp = std::filesystem::temp_directory_path(error);
  if (error)
    temp = "/tmp";
  return temp / "vexel";
}

void KitSystemLog(int priority, const std::string& text) {
  if (priority >= 5)
    WriteLog(priority, "Vexel", text.c_str());
}

std::string FindSystemFont(const std::string& file_name) {
  if (file_name.empty() || file_name.find('/') != std::string::npos)
    return {};
  for (const char* root : kFontRoots) {
    std::error_code error;
    auto entries = std::filesystem::recursive_directory_iterator(
        root, std::filesystem::directory_options::skip_permission_denied, error);
    for (auto it = begin(entries); !error && it != end(entries); it.increment(error)) {
      if (it->path().filename() == file_name && it->is_regular_file(error))
        return it->path().string();
    }
  }
  return {};
}

std::string SystemFontLocation() {
  return "/usr/share/fonts and /usr/local/share/fonts";
}

}  // namespace platform

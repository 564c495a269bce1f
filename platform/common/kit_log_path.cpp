#include <filesystem>
#include <system_error>

#include "kit_log_directory.h"
#include "platform/kit_files.h"

namespace platform {

std::string KitLogPath(const std::string& name) {
  if (name.empty())
    return {};
  const std::filesystem::path file(name);
  if (file.is_absolute())
    return name;
  const std::filesystem::path directory = KitLogDirectory();
  if (directory.empty())
    return {};
  std::error_code error;
  std::filesystem::create_directories(directory, error);
  if (error)
    return {};
  return (directory / file).string();
}

}  // namespace platform

#pragma once

#include <filesystem>

namespace platform {

// Where the kit writes a log file given by bare name; empty when the
// platform offers no such place.
std::filesystem::path KitLogDirectory();

}  // namespace platform

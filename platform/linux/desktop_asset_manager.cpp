// The desktop AAssetManager: reads whole files under one directory. Names are
// relative to it, as asset names are on a phone; absolute names and names
// that climb out with ".." find nothing.
#include <android/asset_manager.h>

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "platform/desktop.h"

struct AAssetManager {
  std::filesystem::path directory;
};

struct AAsset {
  std::vector<char> bytes;
  off64_t position = 0;
};

namespace {

bool StaysInside(const std::filesystem::path& relative) {
  if (relative.empty() || relative.is_absolute())
    return false;
  for (const auto& part : relative) {
    if (part == "..")
      return false;
  }
  return true;
}

off64_t Remaining(const AAsset* asset) {
  return static_cast<off64_t>(asset->bytes.size()) - asset->position;
}

}  // namespace

extern "C" {

AAsset* AAssetManager_open(AAssetManager* manager, const char* filename, int /*mode*/) {
  if (manager == nullptr || filename == nullptr || !StaysInside(filename))
    return nullptr;
  std::error_code error;
  const std::filesystem::path path = manager->directory / filename;
  if (!std::filesystem::is_regular_file(path, error))
    return nullptr;
  std::ifstream file(path, std::ios::binary);
  if (!file)
    return nullptr;
  auto* asset = new AAsset;
  asset->bytes.assign(std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>());
  if (file.bad()) {
    delete asset;
    return nullptr;
  }
  return asset;
}

int AAsset_read(AAsset* asset, void* buffer, size_t count) {
  const off64_t available = Remaining(asset);
  const auto n = static_cast<off64_t>(std::min<size_t>(count, static_cast<size_t>(available)));
  std::copy_n(asset->bytes.data() + asset->position, n, static_cast<char*>(buffer));
  asset->position += n;
  return static_cast<int>(n);
}

off64_t AAsset_seek64(AAsset* asset, off64_t offset, int whence) {
  off64_t base = 0;
  if (whence == SEEK_CUR)
    base = asset->position;
  else if (whence == SEEK_END)
    base = static_cast<off64_t>(asset->bytes.size());
  else if (whence != SEEK_SET)
    return -1;
  const off64_t target = base + offset;
  if (target < 0 || target > static_cast<off64_t>(asset->bytes.size()))
    return -1;
  asset->position = target;
  return target;
}

off_t AAsset_seek(AAsset* asset, off_t offset, int whence) {
  return static_cast<off_t>(AAsset_seek64(asset, offset, whence));
}

off64_t AAsset_getLength64(AAsset* asset) {
  return static_cast<off64_t>(asset->bytes.size());
}

off_t AAsset_getLength(AAsset* asset) {
  return static_cast<off_t>(asset->bytes.size());
}

off64_t AAsset_getRemainingLength64(AAsset* asset) {
  return Remaining(asset);
}

off_t AAsset_getRemainingLength(AAsset* asset) {
  return static_cast<off_t>(Remaining(asset));
}

const void* AAsset_getBuffer(AAsset* asset) {
  return asset->bytes.data();
}

void AAsset_close(AAsset* asset) {
  delete asset;
}

}  // extern "C"

namespace platform::desktop {

AAssetManager* CreateDirectoryAssetManager(const std::string& directory) {
  return new AAssetManager{std::filesystem::path(directory)};
}

void DestroyDirectoryAssetManager(AAssetManager* manager) {
  delete manager;
}

}  // namespace platform::desktop

#pragma once

// Linux counterpart of the NDK's <android/asset_manager.h>: the subset the
// engine and the scene kit call. On Linux an asset manager reads the files
// under one directory.
#include <android/api.h>

#include <stddef.h>
#include <stdint.h>
#include <sys/types.h>

#ifdef __cplusplus
extern "C" {
#endif

typedef struct AAssetManager AAssetManager;
typedef struct AAsset AAsset;

enum {
  AASSET_MODE_UNKNOWN = 0,
  AASSET_MODE_RANDOM = 1,
  AASSET_MODE_STREAMING = 2,
  AASSET_MODE_BUFFER = 3,
};

// Null when the file does not exist, cannot be read, or its name is absolute
// or climbs out of the directory.
ANDROID_DESKTOP_API AAsset* AAssetManager_open(AAssetManager* manager, const char* filename,
                                               int mode);
ANDROID_DESKTOP_API int AAsset_read(AAsset* asset, void* buffer, size_t count);
ANDROID_DESKTOP_API off_t AAsset_seek(AAsset* asset, off_t offset, int whence);
ANDROID_DESKTOP_API off64_t AAsset_seek64(AAsset* asset, off64_t offset, int whence);
ANDROID_DESKTOP_API off_t AAsset_getLength(AAsset* asset);
ANDROID_DESKTOP_API off64_t AAsset_getLength64(AAsset* asset);
ANDROID_DESKTOP_API off_t AAsset_getRemainingLength(AAsset* asset);
ANDROID_DESKTOP_API off64_t AAsset_getRemainingLength64(AAsset* asset);
ANDROID_DESKTOP_API const void* AAsset_getBuffer(AAsset* asset);
ANDROID_DESKTOP_API void AAsset_close(AAsset* asset);

#ifdef __cplusplus
}
#endif

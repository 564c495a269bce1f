#pragma once

// Included first in every file of the Android compile check: what an NDK
// toolchain and bionic's <sys/cdefs.h> define for a 64-bit phone, which
// Debian's compiler and C library do not. The API level is the lowest the
// app supports; off_t is already 64 bits there, so the file-offset renaming
// is empty.
#define __ANDROID__ 1
#define __ANDROID_API__ 24
#define __RENAME_IF_FILE_OFFSET64(func)

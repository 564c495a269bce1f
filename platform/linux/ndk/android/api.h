#pragma once

// The desktop stand-in for the phone's system library exports these names
// from a library built with hidden visibility.
#define ANDROID_DESKTOP_API __attribute__((visibility("default")))

# Compile-only check of the phone build's Android-facing code on Linux: the
# platform's Android files, and the engine and kit files that call the NDK's
# asset manager and native window, are compiled (never linked) against
# Debian's copies of the real NDK headers. Log and asset manager come from
# android-liblog-dev and android-platform-frameworks-native-headers, EGL and
# GLES 2 from the Khronos headers (libegl-dev, libgles-dev, which take their
# Android branch under __ANDROID__). Debian lacks only <android/native_window.h>;
# missing_ndk_headers/ declares what the phone build calls from it. The Linux
# stand-ins under linux/ndk are deliberately not on this include path.
find_path(ANDROID_NDK_LOG_HEADERS android/log.h PATHS /usr/include/android NO_DEFAULT_PATH)
find_path(ANDROID_NDK_ASSET_HEADERS android/asset_manager_jni.h PATHS /usr/include/android
          NO_DEFAULT_PATH)
if(NOT ANDROID_NDK_LOG_HEADERS OR NOT ANDROID_NDK_ASSET_HEADERS)
  message(FATAL_ERROR "Android NDK headers missing: run scripts/setup.sh "
                      "(android-liblog-dev, android-platform-frameworks-native-headers)")
endif()
find_package(PkgConfig REQUIRED)
pkg_check_modules(ANDROID_CHECK_TEXT REQUIRED freetype2 harfbuzz)

file(GLOB android_platform_sources CONFIGURE_DEPENDS ${CMAKE_CURRENT_SOURCE_DIR}/android/*.cpp)
add_library(android_header_check OBJECT
  ${android_platform_sources}
  ${PROJECT_SOURCE_DIR}/vexel/src/font_face.cpp
  ${PROJECT_SOURCE_DIR}/src/jni/vexel_jni.cpp
  ${PROJECT_SOURCE_DIR}/src/renderer/renderer_bridge.cpp)
target_compile_options(android_header_check PRIVATE
  -include ${CMAKE_CURRENT_SOURCE_DIR}/android/missing_ndk_headers/ndk_toolchain.h)
target_include_directories(android_header_check BEFORE PRIVATE
  ${CMAKE_CURRENT_SOURCE_DIR}/android/missing_ndk_headers ${ANDROID_NDK_LOG_HEADERS})
target_include_directories(android_header_check PRIVATE
  include common ${PROJECT_SOURCE_DIR}/src ${PROJECT_SOURCE_DIR}/vexel/include
  ${PROJECT_SOURCE_DIR}/vexel/src)
target_include_directories(android_header_check SYSTEM PRIVATE
  ${JNI_INCLUDE_DIRS} ${OpenCV_INCLUDE_DIRS} ${ANDROID_CHECK_TEXT_INCLUDE_DIRS})
ocr_warnings(android_header_check)

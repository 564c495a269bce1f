# Graphics side of the platform layer.
#
# platform_ndk      the NDK's native window and asset manager: on a phone the
#                   system library; on Linux android_desktop, a small shared
#                   library that stands in for it (same C names, plus the JNI
#                   natives of org.vexel.desktop.OffscreenSurface and
#                   DirectoryAssetManager), linked exactly where a phone build
#                   links the system library.
# vexel_platform_gl the graphics device (EGL context, window surfaces) and the
#                   kit's platform files (log location, system fonts); linked
#                   into libVexelKit.

if(ANDROID)
  add_library(platform_ndk INTERFACE)
  target_link_libraries(platform_ndk INTERFACE android)
  set(platform_gl_sources android/egl_window.cpp android/kit_files_android.cpp)
  set(platform_gl_libs EGL GLESv2 log)
else()
  add_library(android_desktop SHARED linux/desktop_window.cpp linux/desktop_asset_manager.cpp
                                     linux/desktop_jni.cpp)
  target_include_directories(android_desktop PUBLIC linux/ndk linux/include)
  target_include_directories(android_desktop SYSTEM PUBLIC ${JNI_INCLUDE_DIRS})
  target_link_options(android_desktop PRIVATE -Wl,--no-undefined)
  ocr_warnings(android_desktop)

  add_library(platform_ndk INTERFACE)
  target_link_libraries(platform_ndk INTERFACE android_desktop)

  find_library(EGL_LIBRARY EGL REQUIRED)
  find_library(GLES2_LIBRARY GLESv2 REQUIRED)
  set(platform_gl_sources linux/egl_surfaceless.cpp linux/kit_files_linux.cpp)
  set(platform_gl_libs ${EGL_LIBRARY} ${GLES2_LIBRARY})
endif()

add_library(vexel_platform_gl STATIC common/gl_device_shared.cpp common/kit_log_path.cpp
                                     ${platform_gl_sources})
target_include_directories(vexel_platform_gl PUBLIC include PRIVATE common)
target_link_libraries(vexel_platform_gl PUBLIC platform_ndk ${platform_gl_libs} ocr_platform_log)
ocr_warnings(vexel_platform_gl)

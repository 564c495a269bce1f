// Read by the AddressSanitizer runtime in the sanitizer build (unused
// otherwise). OpenCV is built without frame pointers, so only the slow
// unwinder sees the OpenCV frames that tests/sanitizers/lsan.supp names.
extern "C" __attribute__((visibility("default"))) const char* __asan_default_options() {
  return "fast_unwind_on_malloc=0";
}

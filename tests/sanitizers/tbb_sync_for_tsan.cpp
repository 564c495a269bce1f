// Shows ThreadSanitizer how TBB hands work between threads.
//
// Debian's TBB is not instrumented, so TSan cannot see the synchronisation
// inside its scheduler: every task's data would look raced between the thread
// that spawned it and the worker that ran it. TBB announces those hand-overs
// to threading tools itself, as the synchronisation events of the ittnotify
// interface ("releasing" before an object is handed on, "acquired" once it is
// taken), from its library and, built with TBB_USE_PROFILING_TOOLS=2, from its
// headers (spawn, wait, the join of a parallel_for's split ranges). The
// library loads a tool named by INTEL_LIBITTNOTIFY64 and calls the functions
// that the tool exports; this tool turns each event into the matching TSan
// annotation on the same address. Nothing is hidden: accesses that the
// announced hand-overs do not order are still reported.
#include <sanitizer/tsan_interface.h>

#define OCR_ITT_EXPORT extern "C" __attribute__((visibility("default")))

// Its presence makes the library fill its function table by name.
OCR_ITT_EXPORT const char* __itt_api_version() {
  return "tbb-to-tsan";
}

OCR_ITT_EXPORT void __itt_sync_releasing(void* addr) {
  __tsan_release(addr);
}

OCR_ITT_EXPORT void __itt_sync_acquired(void* addr) {
  __tsan_acquire(addr);
}

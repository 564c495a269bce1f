# The two sanitizer builds, each in a build directory of its own:
#   OCR_SANITIZE  AddressSanitizer + UBSan over everything: the C++ tests, and the Java tests in a
#                 JVM that preloads the runtimes (OCR_JVM_SANITIZER_ENVIRONMENT below).
#   OCR_TSAN      ThreadSanitizer over the code that TBB workers and foreign threads run: only
#                 the C++ test binaries labelled `thread` are defined (target thread_tests).
# Neither builds the benchmarks; their timings would be the sanitizers'.
if(OCR_SANITIZE AND OCR_TSAN)
  message(FATAL_ERROR "OCR_SANITIZE and OCR_TSAN exclude each other: use two build directories")
endif()

if(OCR_SANITIZE)
  set(OCR_SANITIZER_FLAGS -fsanitize=address,undefined,float-cast-overflow -fno-omit-frame-pointer
                          -fno-sanitize-recover=undefined,float-cast-overflow)
elseif(OCR_TSAN)
  set(OCR_SANITIZER_FLAGS -fsanitize=thread -fno-omit-frame-pointer)
  # TBB's headers announce their task hand-overs to threading tools; the tests turn those
  # announcements into TSan annotations (tests/sanitizers/tbb_sync_for_tsan.cpp).
  add_compile_definitions(TBB_USE_PROFILING_TOOLS=2)
endif()
if(OCR_SANITIZER_FLAGS)
  set(OCR_BUILD_BENCH OFF)
  add_compile_options(${OCR_SANITIZER_FLAGS})
  add_link_options(${OCR_SANITIZER_FLAGS})
endif()

# The environment of a JVM that loads the ASan build's libraries.
# - The ASan runtime must be the first library of the process, and the java launcher is not
#   instrumented, so both runtimes are preloaded (libubsan for the same reason as libasan: it
#   must exist before the first instrumented library loads).
# - HotSpot turns SIGSEGV (implicit null checks, safepoint polls), SIGBUS (mapped files) and
#   SIGFPE (integer division) into Java exceptions: ASan must leave those signals to it.
# - Leak checking is off: at exit the JVM frees little of its own memory, and none of that is
#   ours (the C++ tests check our leaks).
# - A report ends the JVM with a non-zero status (ASan's default, UBSan's -fno-sanitize-recover
#   and halt_on_error), which fails the JUnit test.
set(OCR_JVM_SANITIZER_ENVIRONMENT "")
if(OCR_SANITIZE)
  set(preload "")
  foreach(runtime libasan.so libubsan.so)
    execute_process(COMMAND ${CMAKE_CXX_COMPILER} -print-file-name=${runtime}
                    OUTPUT_VARIABLE runtime_path OUTPUT_STRIP_TRAILING_WHITESPACE)
    get_filename_component(runtime_path ${runtime_path} REALPATH)
    if(NOT EXISTS ${runtime_path})
      message(FATAL_ERROR "${CMAKE_CXX_COMPILER} names no ${runtime}")
    endif()
    list(APPEND preload ${runtime_path})
  endforeach()
  string(REPLACE ";" ":" preload "${preload}")
  set(OCR_JVM_SANITIZER_ENVIRONMENT
      "LD_PRELOAD=${preload}"
      "ASAN_OPTIONS=handle_segv=0:handle_sigbus=0:handle_sigfpe=0:allow_user_segv_handler=1:detect_leaks=0"
      "UBSAN_OPTIONS=print_stacktrace=1:halt_on_error=1")
endif()

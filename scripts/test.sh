#!/usr/bin/env bash
# Builds everything and runs every test, in three build trees:
#   build/       the C++ tests and the Java tests in a real JVM;
#   build-asan/  the same under AddressSanitizer + UndefinedBehaviorSanitizer
#                (the JVM preloads the sanitizer runtimes);
#   build-tsan/  the C++ tests of the code that runs on TBB workers, under
#                ThreadSanitizer.
# Each stage's wall time is printed when it ends.
set -euo pipefail
cd "$(dirname "$0")/.."

./scripts/setup.sh
jobs=$(nproc)

# timed <stage> <command>...
timed() {
  local stage=$1 start=$SECONDS
  shift
  "$@"
  echo "== ${stage}: $((SECONDS - start)) s"
}

cmake -S . -B build -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
timed "build" cmake --build build -j "$jobs"
timed "tests" ctest --test-dir build --output-on-failure -j "$jobs"

cmake -S . -B build-asan -DCMAKE_BUILD_TYPE=Debug -DOCR_SANITIZE=ON >/dev/null
timed "ASan build" cmake --build build-asan -j "$jobs"
timed "ASan tests" ctest --test-dir build-asan --output-on-failure -j "$jobs" -LE format

cmake -S . -B build-tsan -DCMAKE_BUILD_TYPE=RelWithDebInfo -DOCR_TSAN=ON >/dev/null
timed "TSan build" cmake --build build-tsan -j "$jobs" --target thread_tests
timed "TSan tests" ctest --test-dir build-tsan --output-on-failure -j "$jobs" -L thread

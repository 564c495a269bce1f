#!/usr/bin/env bash
# Runs every fuzz target under libFuzzer with AddressSanitizer and UBSan:
# until 1,000,000 runs each, or for SECONDS each when given. Builds
# build-fuzz with clang first. Each target starts from a scratch copy of its
# seed corpus (the repository's corpora stay as they are; the regression
# inputs are replayed by ctest, and some are deliberately slow); findings are written to build-fuzz/findings/<target>/. The engine's
# standard output (the tracker's homography dump) is closed during a run.
#   scripts/fuzz.sh [SECONDS]
# FUZZ_TARGETS="tracker text_layout" picks targets.
set -euo pipefail
cd "$(dirname "$0")/.."

seconds="${1:-}"
./scripts/setup.sh

CC=clang CXX=clang++ cmake -S . -B build-fuzz -DCMAKE_BUILD_TYPE=RelWithDebInfo -DOCR_FUZZ=ON \
  >/dev/null
read -r -a targets <<<"${FUZZ_TARGETS:-frame_mapping tracker color_statistics text_layout inpainting_request text_reader}"
nice -n 10 cmake --build build-fuzz -j "$(nproc)" --target "${targets[@]/%/_fuzzer}"

# Longest input per target: enough bytes for every decision the target reads
# (long texts come from repeating the input).
declare -A max_len=([inpainting_request]=256 [color_statistics]=384 [tracker]=256
                    [frame_mapping]=1024 [text_layout]=1024)

export OCRAR_LOG_LEVEL=7
export LSAN_OPTIONS="suppressions=$PWD/tests/sanitizers/lsan.supp:print_suppressions=0"
export UBSAN_OPTIONS="print_stacktrace=1:halt_on_error=1"

if [ -n "$seconds" ]; then limit=(-max_total_time="$seconds"); else limit=(-runs=1000000); fi
status=0
summary=()
for target in "${targets[@]}"; do
  work="build-fuzz/fuzz-work/$target"
  findings="build-fuzz/findings/$target"
  rm -rf "$work"
  mkdir -p "$work" "$findings"
  cp fuzz/corpus/"$target"/* "$work"/
  log="build-fuzz/findings/$target.log"
  echo "fuzz: $target ..."
  set +e
  # The inputs of past findings first, once each, under clang's sanitizers.
  regressions=(fuzz/regressions/"$target"/[!.]*)
  if [ -e "${regressions[0]}" ] &&
    ! "build-fuzz/bin/${target}_fuzzer" -close_fd_mask=1 "${regressions[@]}" >"$log.replay" 2>&1; then
    echo "fuzz: $target fails on a regression input, see $log.replay"
    status=1
  fi
  nice -n 10 "build-fuzz/bin/${target}_fuzzer" "${limit[@]}" -max_len="${max_len[$target]}" \
    -timeout=25 -rss_limit_mb=4096 -close_fd_mask=1 -print_final_stats=1 -artifact_prefix="$findings/" \
    "$work" >"$log" 2>&1
  rc=$?
  set -e
  runs=$(sed -n 's/^stat::number_of_executed_units: *//p' "$log" | tail -1)
  per_second=$(sed -n 's/^stat::average_exec_per_sec: *//p' "$log" | tail -1)
  found=$(find "$findings" -maxdepth 1 -type f | wc -l)
  summary+=("$(printf '%-20s runs %9s  runs/s %6s  findings %s' "$target" "${runs:-?}" \
    "${per_second:-?}" "$found")")
  if [ "$rc" -ne 0 ] || [ "$found" -ne 0 ]; then
    status=1
    echo "fuzz: $target stopped with a finding, see $log and $findings/"
  fi
done
printf '%s\n' "${summary[@]}"
exit "$status"

#!/usr/bin/env bash
# Runs the soak program (build/bin/soak) for a few frames of track, erase and
# draw under valgrind's memcheck, in one JVM, and reports the definite leaks
# and memory errors whose stacks pass through the engine's own libraries
# (libocr_ndk, libVexelKit, and libandroid_desktop, the desktop's stand-in for
# the phone's system library). One leak is expected and accepted: the two
# reference lists of every released tracker (releaseTracker destroys the
# tracker through its base on purpose). Anything else fails the run.
#
#   scripts/memcheck.sh [FRAMES]     (default 20; needs a built build/)
#
# Not part of the test command: under valgrind the JVM runs interpreted and
# the drawing in Mesa's software rasteriser is slow (minutes for 20 frames).
set -euo pipefail
cd "$(dirname "$0")/.."

frames=${1:-20}
build=${BUILD_DIR:-build}
out=$build/memcheck
log=$out/valgrind.log

command -v valgrind >/dev/null || { echo "memcheck: valgrind is missing (apt-get install valgrind)" >&2; exit 2; }
[ -x "$build/bin/soak" ] || { echo "memcheck: $build/bin/soak is missing; build first" >&2; exit 2; }
mkdir -p "$out"
rm -f "$out/unexpected.txt"

# The JVM under valgrind: interpreted only (no JIT code to re-translate), a
# small fixed heap without pre-touching, one GC thread, the fewest pages the
# interpreter touches below the stack pointer on every call (each touch is an
# error for memcheck, suppressed in memcheck.supp, and costs a stack walk).
# Mesa's rasteriser generates its shaders at run time, hence --smc-check; one
# rasteriser thread keeps the run short. Uninitialised-value tracking is off:
# the JVM's own stack scanning floods it, and the question here is leaks.
# Source paths are printed whole, so that the engine's frames are told by
# their files.
start=$(date +%s)
SOAK_WRAPPER="valgrind --tool=memcheck --leak-check=full --show-leak-kinds=definite
  --errors-for-leak-kinds=definite --undef-value-errors=no --smc-check=all-non-file
  --error-limit=no --num-callers=24 --fullpath-after=
  --suppressions=scripts/memcheck.supp --log-file=$log" \
  SOAK_JVM_FLAGS="-Xint -Xms64m -Xmx64m -XX:+UseSerialGC -XX:-UsePerfData -XX:StackShadowPages=10" \
  LP_NUM_THREADS=0 "$build/bin/soak" --frames "$frames" 2>"$out/soak.txt" || true
seconds=$(($(date +%s) - start))

grep -q "LEAK SUMMARY" "$log" || {
  echo "memcheck: the run did not finish (see $log, $out/soak.txt)" >&2
  exit 1
}

# Splits the log into records (an error or a loss record, up to the next blank
# line) and keeps those through the engine's libraries, sorted into the
# accepted tracker leak and everything else.
engine="$PWD/(src|vexel|platform)/|libocr_ndk|libVexelKit|libandroid_desktop"
sed 's/^==[0-9]*== \{0,1\}//' "$log" | awk -v engine="$engine" -v out="$out" '
  function flush() {
    if (record != "" && record ~ engine) {
      if (record ~ /definitely lost/ && record ~ /OcrTrackerRotRect::AppendReferences/) {
        accepted++; accepted_bytes += bytes
      } else {
        unexpected++; print record "\n" > (out "/unexpected.txt")
      }
    }
    record = ""
  }
  /^$/ { flush(); next }
  record == "" && /are definitely lost in loss record/ { record = $0; bytes = $1; gsub(",", "", bytes); next }
  record == "" && /^(Invalid|Mismatched|Source and destination|Conditional|Syscall param)/ { record = $0; next }
  record != "" { record = record "\n" $0 }
  END {
    flush()
    printf "%d %d %d\n", accepted, accepted_bytes, unexpected > (out "/counts.txt")
  }'
read -r accepted accepted_bytes unexpected <"$out/counts.txt"

echo "memcheck: $frames frames in $seconds s under valgrind ($log)"
grep -E "definitely lost:|indirectly lost:|ERROR SUMMARY" "$log" | sed 's/^==[0-9]*== /  whole process: /'
echo "  through the engine: ${accepted:-0} definite leak records of released trackers' reference lists" \
  "(${accepted_bytes:-0} bytes, accepted), ${unexpected:-0} other records"
if [ "${unexpected:-0}" -ne 0 ]; then
  cat "$out/unexpected.txt"
  exit 1
fi

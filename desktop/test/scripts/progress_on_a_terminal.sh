#!/usr/bin/env bash
# The progress bar through the launcher: shown when standard error is a
# terminal (a pseudo-terminal made by script(1)), absent when it is a file;
# the engine tracker's print on standard output stays off the terminal.
#   progress_on_a_terminal.sh BUILD_DIR
set -euo pipefail
build="$1"
work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT

"$build/write-bundled-inputs.sh" "$work/inputs" >/dev/null
export TRANSLATE_ENGINE_STDOUT="$work/engine-stdout.log"
export OCRAR_LOG_FILE="$work/native.log"

script -qec "'$build/run-translate.sh' video '$work/inputs/camera.mp4' --out '$work/tty'" \
  "$work/terminal.log" >/dev/null
"$build/run-translate.sh" photo "$work/inputs/station.png" --out "$work/file" \
  >"$work/stdout.log" 2>"$work/stderr.log"

fail() { echo "FAIL: $*" >&2; exit 1; }
grep -q $'\r\\[#*\\.*\\] *[0-9]*% camera: frame' "$work/terminal.log" ||
  fail "no progress bar on the terminal: $(head -c 400 "$work/terminal.log" | od -c | head)"
grep -q '90 frames' "$work/terminal.log" || fail "no summary on the terminal"
if grep -q homography "$work/terminal.log"; then fail "the tracker's print reached the terminal"; fi
grep -q homography "$work/engine-stdout.log" || fail "the tracker's print is not in its file"
if grep -q $'\r' "$work/stderr.log"; then fail "a progress bar went into a file"; fi
grep -q '1 photo' "$work/stdout.log" || fail "no summary on standard output"
echo "progress bar on a terminal, none in a file"

#!/usr/bin/env bash
# What a user sees through the launcher when a video cannot be used: one line
# on standard error (none of the video readers' own complaints), the
# documented status, and no output written.
#   launcher_refusals.sh BUILD_DIR
set -euo pipefail
build="$1"
work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT
export TRANSLATE_ENGINE_STDOUT="$work/engine-stdout.log"
export OCRAR_LOG_FILE="$work/native.log"

failed=0
# refused INPUT STATUS MESSAGE
refused() {
  local status=0
  "$build/run-translate.sh" video "$1" --out "$work/out" >"$work/stdout.log" \
    2>"$work/stderr.log" || status=$?
  local expected="translate: $1: $3"
  if [ "$status" != "$2" ] || [ "$(cat "$work/stderr.log")" != "$expected" ]; then
    echo "FAIL: $1: status $status, standard error:" >&2
    cat "$work/stderr.log" >&2
    echo "wanted status $2 and only: $expected" >&2
    failed=1
  fi
  if [ -e "$work/out" ]; then
    echo "FAIL: $1: the output folder was created" >&2
    failed=1
  fi
}

echo "not a video" >"$work/clip.mp4"
refused "$work/clip.mp4" 65 "not a video OpenCV can read"
: >"$work/empty.mp4"
refused "$work/empty.mp4" 67 "the file is empty"
exit "$failed"

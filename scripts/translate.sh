#!/usr/bin/env bash
# Translates photos and videos in place with real OCR and machine
# translation, offline:
#   ./scripts/translate.sh photo IMAGE... --from en --to es --out DIR
#   ./scripts/translate.sh video VIDEO_OR_FRAME_FOLDER --from en --to es --out DIR [--live]
# Installs what is missing and builds on first use (quietly; the build's
# output goes to build/build.log), then runs the desktop host.
set -euo pipefail
root="$(cd "$(dirname "$0")/.." && pwd)"

"$root/scripts/setup.sh"
mkdir -p "$root/build"
if ! { cmake -S "$root" -B "$root/build" -DCMAKE_BUILD_TYPE=RelWithDebInfo &&
       cmake --build "$root/build" -j "$(nproc)"; } >"$root/build/build.log" 2>&1; then
  tail -n 30 "$root/build/build.log" >&2
  echo "translate: the build failed; see $root/build/build.log" >&2
  exit 70
fi
exec "$root/build/run-translate.sh" "$@"

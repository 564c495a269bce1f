#!/usr/bin/env bash
# Builds the engine and runs the demo host on the bundled (generated) input;
# pictures and tables go to out/, the engine's own log to out/native.log.
set -euo pipefail
cd "$(dirname "$0")/.."

./scripts/setup.sh
cmake -S . -B build -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build build -j "$(nproc)"
mkdir -p out
rm -f out/native.log
# The engine logs every step under "OCRAR-Native"; keep it in a file so the
# demo's own report stays readable.
OCRAR_LOG_FILE="$(pwd)/out/native.log" OCRAR_LOG_LEVEL=${OCRAR_LOG_LEVEL:-7} \
  ./build/run-demo.sh "$(pwd)/out"

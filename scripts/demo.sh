#!/usr/bin/env bash
# Builds the engine and runs the demo host on the bundled default input;
# pictures go to out/.
set -euo pipefail
cd "$(dirname "$0")/.."

./scripts/setup.sh
cmake -S . -B build -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build build -j "$(nproc)"
OCRAR_LOG_LEVEL=${OCRAR_LOG_LEVEL:-6} ./build/run-demo.sh "$(pwd)/out"

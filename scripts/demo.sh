#!/usr/bin/env bash
# The main job: builds everything, then translates the bundled photo-like
# scenes (signs, some tilted, and a printed page) from English into Spanish
# with real OCR and machine translation, a notice into Japanese, Chinese and
# German through phrase tables, and a short hand-held camera video into
# Spanish. Inputs are generated into out/inputs; pictures, videos and JSON go
# to out/.
set -euo pipefail
cd "$(dirname "$0")/.."

./scripts/setup.sh
cmake -S . -B build -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build build -j "$(nproc)"

rm -rf out
mkdir -p out
export OCRAR_LOG_FILE="$(pwd)/out/native.log"
./build/write-bundled-inputs.sh out/inputs
echo "== photos, English to Spanish =="
./build/run-translate.sh photo out/inputs/{street,station,shop,page}.png \
  --from en --to es --out out/photos
for lang in ja zh de; do
  echo "== notice, English to $lang (phrase table desktop/phrases/demo-$lang.tsv) =="
  ./build/run-translate.sh photo out/inputs/notice.png --from en --to "$lang" \
    --translations "desktop/phrases/demo-$lang.tsv" --out "out/notice-$lang"
done

echo "== a hand-held camera video, English to Spanish (offline, then live) =="
./build/run-translate.sh video out/inputs/camera.mp4 --from en --to es --out out/video
./build/run-translate.sh video out/inputs/camera.mp4 --from en --to es --out out/video-live --live
echo "pictures: out/photos, out/notice-{ja,zh,de}, out/video, out/video-live; engine log: out/native.log"

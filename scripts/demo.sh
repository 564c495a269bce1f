#!/usr/bin/env bash
# The main job: builds everything, then translates the bundled photo-like
# scenes (signs, some tilted, and a printed page) from English into Spanish
# with real OCR and machine translation, a notice into Japanese, Chinese and
# German through phrase tables, and a short hand-held camera video into
# Spanish. Everything goes to out/demo/ (inputs generated into out/demo/inputs),
# a folder of the demo's own: out/ is also translate.sh's default output
# folder, and a user's translations there are left alone.
set -euo pipefail
cd "$(dirname "$0")/.."

./scripts/setup.sh
cmake -S . -B build -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build build -j "$(nproc)"

demo=out/demo
rm -rf "$demo"
mkdir -p "$demo"
export OCRAR_LOG_FILE="$(pwd)/$demo/native.log"
./build/write-bundled-inputs.sh "$demo/inputs"
echo "== photos, English to Spanish =="
./build/run-translate.sh photo "$demo"/inputs/{street,station,shop,page}.png \
  --from en --to es --out "$demo/photos"
for lang in ja zh de; do
  echo "== notice, English to $lang (phrase table desktop/phrases/demo-$lang.tsv) =="
  ./build/run-translate.sh photo "$demo/inputs/notice.png" --from en --to "$lang" \
    --translations "desktop/phrases/demo-$lang.tsv" --out "$demo/notice-$lang"
done

echo "== a hand-held camera video, English to Spanish (offline, then live) =="
./build/run-translate.sh video "$demo/inputs/camera.mp4" --from en --to es --out "$demo/video"
./build/run-translate.sh video "$demo/inputs/camera.mp4" --from en --to es \
  --out "$demo/video-live" --live
echo "pictures: $demo/photos, $demo/notice-{ja,zh,de}, $demo/video, $demo/video-live;" \
  "engine log: $demo/native.log"

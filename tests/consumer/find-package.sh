#!/usr/bin/env bash
# find-package.sh HERE LIBDIR BUILD: a CMake project on the installed tree.
set -euo pipefail
rm -rf "$3"
cmake -S "$1/host" -B "$3" -G Ninja -DQorVIO_DIR="$2/cmake/QorVIO" -DHOST_BOARD=SimBoard.cpp >/dev/null
cmake --build "$3"
"$3/host"
if [ -e "$2/libQorBoard.so" ]; then "$3/named"; fi

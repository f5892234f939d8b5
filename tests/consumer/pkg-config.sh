#!/usr/bin/env bash
# pkg-config.sh HERE LIBDIR BUILD: one compiler call on the installed tree.
set -euo pipefail
mkdir -p "$3"
export PKG_CONFIG_PATH=$2/pkgconfig
for package in qorboard qorvio qorcore qorjtag qorutil; do
  [ "$(pkg-config --cflags $package | xargs -n 1 | sort -u | grep -cv '^-I')" -eq 0 ]
done
# shellcheck disable=SC2046,SC2086 # they are lists of options
"$CXX" -std=c++17 $CXXFLAGS "$1"/host/{host,SimBoard}.cpp $(pkg-config --cflags --libs qorvio) -Wl,-rpath,"$2" -o "$3/host"
"$3/host"

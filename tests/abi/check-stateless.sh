#!/usr/bin/env bash
# check-stateless.sh LIBRARY: the library has no static initialisation and no writable variable of its own.
set -euo pipefail
symbols=$(objdump -t -C "$1")
if grep -E '_GLOBAL__sub_I|__static_initialization|__cxx_global_var_init' <<<"$symbols"; then
  echo "$(basename "$1") initialises something when it is loaded"
  exit 1
fi
if grep -E '\s\.(data|bss|tdata|tbss)\s' <<<"$symbols" | grep 'Qor' | grep -v '__odr_asan'; then
  echo "$(basename "$1") has a variable"
  exit 1
fi
grep -q 'QorVIO_initCore' <<<"$symbols" # a stripped library would say nothing

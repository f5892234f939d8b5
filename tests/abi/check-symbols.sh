#!/usr/bin/env bash
# check-symbols.sh LIBRARY LIST: the library shows exactly the listed symbols.
set -euo pipefail
diff -u --label "listed in $(basename "$2")" --label "shown by $(basename "$1")" \
  <(grep -v '^#' "$2" | LC_ALL=C sort) \
  <(nm -D --defined-only "$1" | awk '$2 != "A" { sub(/@.*/, "", $3); print $3 }' | LC_ALL=C sort)

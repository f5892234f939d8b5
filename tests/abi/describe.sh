#!/usr/bin/env bash
# describe.sh LIBRARY FILE: writes the interface that the library exports, read from its debug information: functions,
# vtable slots, layout of classes.
set -euo pipefail
here=$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)
top=${here%/tests/abi}
abidw --out-file "$2" --headers-dir "$top/include" --headers-dir "$top/platform/include" --drop-private-types \
  --exported-interfaces-only --no-corpus-path --no-comp-dir-path --no-show-locs --no-parameter-names --no-elf-needed \
  --suppressions "$here/QorVIO.suppr" "$1"
sed -i "s|path='$top/|path='|" "$2"

#!/usr/bin/env bash
# check-interface.sh LIBRARY DESCRIPTION: the library, with debug information, exports what the description says.
set -euo pipefail
built=$(mktemp)
trap 'rm -f "$built"' EXIT
"$(dirname "${BASH_SOURCE[0]}")/describe.sh" "$1" "$built"
abidiff "$2" "$built" || {
  echo "the exported interface has changed; if it is meant to: scripts/update-abi"
  exit 1
}

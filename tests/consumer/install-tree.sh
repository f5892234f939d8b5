#!/usr/bin/env bash
# install-tree.sh BUILD TREE: installs, then moves the tree, which must not mind.
set -euo pipefail
rm -rf "$2" "$2.elsewhere"
cmake --install "$1" --prefix "$2.elsewhere" >/dev/null
mv "$2.elsewhere" "$2"
if grep -rIlF -e "$1" -e elsewhere "$2"; then
  echo "these files name the place where they were built or first installed"
  exit 1
fi

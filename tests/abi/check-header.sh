#!/usr/bin/env bash
# check-header.sh COMPILER HEADER INCLUDE-OPTION...: the header compiles on its own, without a warning.
set -euo pipefail
"$1" -std=c++17 -Wall -Wextra -Wpedantic -Werror -fsyntax-only -x c++ "${@:3}" -include "$2" /dev/null

# What the tests of the tool share: each runs on a simulated board, in a folder of its own. Programs in the background,
# whose id is in pid: no wait for them is without end, and none outlives its test.

export BATS_TEST_TIMEOUT=60

begin() {
  cd "$BATS_TEST_TMPDIR" || exit 1
  unset QORVIO_CORE QORVIO_SIGNALS
  export QORVIO_CABLE=sim: XDG_STATE_HOME=$PWD
}
setup() { begin; }

teardown() { [ -z "${pid:-}" ] || kill -KILL "$pid" 2>/dev/null || true; }

gives() {  # gives STATUS TEXT COMMAND...: how it ends, and what it prints, as a pattern of the shell
  local wanted=$1 text=$2
  shift 2
  run "$QORVIO" "$@"
  echo "$*: exit $status, says: $output"
  # shellcheck disable=SC2053
  [[ $status -eq $wanted && $output == $text ]]
}

fails() { gives "$1" "$(printf 'qorvio: %q' "$2")" "${@:3}"; }  # fails STATUS TEXT COMMAND...: with this message alone

tells() {  # tells FILE: waits until the program has written to it
  until [ -s "$1" ]; do
    kill -0 "$pid" || return 1
    sleep 0.05
  done
}

catches_interrupt() {  # waits until Ctrl-C would not end the program by itself; the shell before it catches it too
  until [[ $(cat "/proc/$pid/comm") == qorvio* ]] && grep -q '^SigCgt:.*[2367abef]$' "/proc/$pid/status"; do
    kill -0 "$pid" || return 1
    sleep 0.05
  done
}

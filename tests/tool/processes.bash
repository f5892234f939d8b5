# Programs in the background, whose id is in pid: no wait for them is without end, and none outlives its test.

export BATS_TEST_TIMEOUT=60

teardown() { [ -z "${pid:-}" ] || kill -KILL "$pid" 2>/dev/null || true; }

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

# The same three commands by every cable that leads out of the process. Needs QORVIO, the tool; openocd, jq.

BATS_TEST_TIMEOUT=60

setup() {
  cd "$BATS_TEST_TMPDIR" || exit 1
  unset QORVIO_CORE QORVIO_SIGNALS
  export QORVIO_CABLE=sim:
  export XDG_STATE_HOME=$BATS_TEST_TMPDIR
  "$QORVIO" simulate --json >told &
  board=$!
  for _ in {1..100}; do [ -s told ] || sleep 0.05; done
  QORVIO_BOARD_PORT=$(jq .port told)
  export QORVIO_BOARD_PORT
  direct=rbb:127.0.0.1:$QORVIO_BOARD_PORT
  through="openocd:?config=$QORVIO_SOURCES/rtl/cosim/openocd.cfg"
}

teardown() { kill "$board" ${host:+"$host"} 2>/dev/null || true; }

@test "scan, write and read do the same by a remote_bitbang cable and through OpenOCD" {
  for cable in "$direct" "$through"; do
    [ "$("$QORVIO" --cable "$cable" --json scan | jq -c '[.devices[] | .idcode, .cores[].core]')" = \
      '["0A5F1093","0.1.0","0.1.1","1234567B","1.1.0"]' ]
    "$QORVIO" --cable "$cable" write async_out_data=5A
    "$QORVIO" --cable "$cable" read >/dev/null
    "$QORVIO" --cable "$cable" write async_out_data=A5
    run "$QORVIO" --cable "$cable" read
    [[ ${lines[1]} =~ ^async_in_data\ +0xA5\ +↕$ ]]
    run "$QORVIO" --cable "$cable" doctor --write
    [ "$status" -eq 0 ]
    [[ ${lines[7]} == "ok       write and read back  8 bits written and read back" ]]
  done
}

@test "a server of our own ends with its host, though the host is killed" {
  "$QORVIO" --cable "$through" watch --json >frames &
  host=$!
  for _ in {1..200}; do [ -s frames ] || sleep 0.05; done
  [ -s frames ]
  kill -KILL $host
  host=
  run "$QORVIO" --cable "$direct" scan # the board takes one client at a time
  [ "$status" -eq 0 ]
  [[ ${lines[1]} == "0       0A5F1093  device0  6" ]]
}

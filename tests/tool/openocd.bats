# The same three commands by every cable that leads out of the process. Needs QORVIO, the tool; openocd, jq.

load processes

setup() {
  begin
  "$QORVIO" simulate --json >told 3>&- &
  pid=$!
  tells told
  QORVIO_BOARD_PORT=$(jq .port told)
  export QORVIO_BOARD_PORT
  direct=rbb:127.0.0.1:$QORVIO_BOARD_PORT
  through="openocd:?config=$QORVIO_SOURCES/rtl/cosim/openocd.cfg"
}

teardown() { kill "$pid" ${host:+"$host"} 2>/dev/null || true; }

@test "scan, write and read do the same by a remote_bitbang cable and through OpenOCD" {
  for cable in "$direct" "$through"; do
    [ "$("$QORVIO" --cable "$cable" --json scan | jq -c '[.devices[] | .idcode, .cores[].core]')" = \
      '["0A5F1093","0.1.0","0.1.1","1234567B","1.1.0"]' ]
    "$QORVIO" --cable "$cable" write async_out_data=5A
    "$QORVIO" --cable "$cable" read >/dev/null
    "$QORVIO" --cable "$cable" write async_out_data=A5
    gives 0 $'*\nasync_in_data  0xA5   ↕*' --cable "$cable" read
    gives 0 '*8 bits written and read back*' --cable "$cable" doctor --write
  done
}

@test "a server of our own ends with its host, though the host is killed" {
  "$QORVIO" --cable "$through" watch --json >frames &
  host=$!
  tells frames
  kill -KILL $host
  host=
  gives 0 '*0       0A5F1093  device0  6*' --cable "$direct" scan # the board takes one client at a time
}

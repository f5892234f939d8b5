# A simulated board for a program that is not ours. Needs QORVIO, the tool; openocd, jq.

load processes

serve() {  # serve ARGUMENTS: starts the board, and waits until it tells where
  "$QORVIO" simulate "$@" >told 2>wrong 3>&- &
  pid=$!
  tells told
}

scan() {  # scan PORT COMMAND...: what OpenOCD prints
  local port=$1
  shift
  openocd -c "adapter driver remote_bitbang; remote_bitbang host 127.0.0.1; remote_bitbang port $port" \
    -c "jtag newtap fpga tap -irlen 6 -expected-id 0x0A5F1093" \
    -c "jtag newtap cpld tap -irlen 8 -expected-id 0x1234567B" -c init "${@/#/-c}" -c shutdown 2>&1
}

@test "OpenOCD finds both devices, and the board stays as one client left it for the next" {
  serve --json
  port=$(jq .port told)
  [ "$(jq -c . told)" = "{\"host\":\"127.0.0.1\",\"port\":$port,\"board\":\"demo\"}" ]
  run scan "$port" 'irscan fpga.tap 1; echo "fpga [drscan fpga.tap 32 0]"' \
    'irscan cpld.tap 1; echo "cpld [drscan cpld.tap 32 0]"' \
    'irscan fpga.tap 2; echo "hello [drscan fpga.tap 32 0]"'
  [ "$status" -eq 0 ]
  [[ $output == *"fpga.tap tap/device found: 0x0a5f1093"* && $output == *"cpld.tap tap/device found: 0x1234567b"* ]]
  [[ $output == *"fpga 0a5f1093"* && $output == *"cpld 1234567b"* && $output != *UNEXPECTED* ]]
  # A hub says hello with one bit, and nothing more to a scan without a frame.
  [[ $output == *"hello 00000001"* ]]
  "$QORVIO" --cable "rbb:127.0.0.1:$port" write async_out_data=5A
  gives 0 $'*\nasync_in_data  0x5A *' --cable "rbb:127.0.0.1:$port" read async_in_data
  kill -INT $pid
  wait $pid
  pid=
  [ ! -s wrong ]
}

@test "it tells where it is, and why it cannot be there" {
  serve "$QORVIO_SOURCES/examples/boards/lab.toml"
  [[ $(cat told) =~ ^serving\ .*/lab.toml\ on\ 127.0.0.1:([0-9]+)\;\ cable\ rbb:127.0.0.1:([0-9]+)\;\ Ctrl-C\ ends\ it$ ]]
  port=${BASH_REMATCH[1]}
  [ "$port" = "${BASH_REMATCH[2]}" ]
  fails 1 "cannot listen on port $port: Address already in use" simulate --port "$port"
  fails 2 "missing.toml: cannot be opened: No such file or directory" simulate missing.toml
  kill -TERM $pid
  wait $pid
  pid=
}

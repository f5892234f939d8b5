# A simulated board for a program that is not ours. Needs QORVIO, the tool; openocd, jq.

load processes

setup() {
  cd "$BATS_TEST_TMPDIR" || exit 1
  unset QORVIO_CABLE QORVIO_CORE QORVIO_SIGNALS
}

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
    'irscan fpga.tap 2; echo "head [drscan fpga.tap 26 0x3C1E001]"'
  [ "$status" -eq 0 ]
  [[ $output == *"fpga.tap tap/device found: 0x0a5f1093"* && $output == *"cpld.tap tap/device found: 0x1234567b"* ]]
  [[ $output == *"fpga 0a5f1093"* && $output == *"cpld 1234567b"* && $output != *UNEXPECTED* ]]
  # The head of the answer tells of the frame before: nothing yet at first, then its code 00.
  [[ $output == *"head "*a0f0* ]]
  run scan "$port" 'irscan fpga.tap 2; echo "head [drscan fpga.tap 16 0xFFFF]"'
  [[ $output == *"head a000"* ]]
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
  run "$QORVIO" simulate --port "$port"
  [ "$status" -eq 1 ]
  [ "$output" = "qorvio: cannot listen on port $port: Address already in use" ]
  run "$QORVIO" simulate missing.toml
  [ "$status" -eq 2 ]
  [ "$output" = "qorvio: missing.toml: cannot be opened: No such file or directory" ]
  kill -TERM $pid
  wait $pid
  pid=
}

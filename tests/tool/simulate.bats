# A simulated board for other programs. Needs QORVIO, the tool; openocd, jq.

load processes

serve() {  # serve ARGUMENTS: starts the board, and waits until it says where
  "$QORVIO" simulate "$@" >told 2>wrong 3>&- &
  pid=$!
  tells told
}

@test "the board stays as one client left it for the next" {
  serve --json
  port=$(jq .port told)
  [ "$(jq -c . told)" = "{\"host\":\"127.0.0.1\",\"port\":$port,\"board\":\"demo\"}" ]
  "$QORVIO" --cable "rbb:127.0.0.1:$port" write async_out_data=5A
  gives 0 $'*\nasync_in_data  0x5A *' --cable "rbb:127.0.0.1:$port" read async_in_data
  # What moved is shown once, to whoever asks for it.
  "$QORVIO" --cable "rbb:127.0.0.1:$port" write async_out_data=5B
  for shown in '0 0x1 ↑' '1 0x1 ·' '0 0x1 ·'; do
    read -r bit value arrow <<<"$shown"
    "$QORVIO" --cable "rbb:127.0.0.1:$port" read 'async_in_data[7:4]'
    run "$QORVIO" --cable "rbb:127.0.0.1:$port" read "async_in_data[$bit]"
    [[ ${lines[1]} =~ $value\ +$arrow ]]
  done
  kill -INT $pid
  wait $pid
  pid=
  [ ! -s wrong ]
}

@test "it says where it is, and why it cannot be there" {
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

@test "an OpenOCD of our own ends with its host, though the host is killed" {
  serve --json
  QORVIO_BOARD_PORT=$(jq .port told)
  export QORVIO_BOARD_PORT
  "$QORVIO" --cable "openocd:?config=$QORVIO_SOURCES/rtl/cosim/openocd.cfg" watch --json >frames &
  host=$!
  tells frames
  kill -KILL $host
  gives 0 '*0       0A5F1093  device0  6*' --cable "rbb:127.0.0.1:$QORVIO_BOARD_PORT" scan # the board takes one client at a time
}

@test "a board that serves another client is told of as one" {
  serve --json
  cable=rbb:127.0.0.1:$(jq .port told)
  "$QORVIO" --cable "$cable" watch --json >frames 3>&- &
  other=$!
  until [ -s frames ]; do sleep 0.05; done
  run "$QORVIO" --cable "$cable?timeout=1" scan
  kill $other
  [ "$status" -eq 1 ]
  [[ $output == *" gave 0 of "*" answers within "*": another program may be connected" ]]
}

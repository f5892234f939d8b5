# What stays of outputs when a command ends. Needs QORVIO_LOSSY, the tool on a board that goes down after N exchanges.

load processes

setup() { begin && export QORVIO=$QORVIO_LOSSY QORVIO_CORE=0.1.0 QORVIO_CABLE=lossy:7; }

remembers() {  # remembers ASYNC KNOWN SYNC KNOWN: what the file contains, which is the only one in its folder
  local file
  file=$(find qorvio -name '*.json')
  cat "$file"
  [ "$(jq -r '[.async_out, .async_out_known, .sync_out, .sync_out_known] | join(" ")' "$file")" = "$1 $2 $3 $4" ]
}

@test "an interrupted press releases its output, and leaves alone what others gave meanwhile" {
  "$QORVIO" write async_out_data=FF
  "$QORVIO" --json press 'async_out_data[0]' --for 1h >told 3>&- &
  pid=$!
  catches_interrupt
  "$QORVIO" toggle 'async_out_data[3]'
  remembers F7 FF 00 00
  kill -INT $pid
  status=0
  wait $pid || status=$?
  [ "$status" -eq 130 ]
  [ "$(tr -d ' \n' <told)" = '[{"name":"async_out_data[0]","width":1,"steps":["0"]}]' ]
  remembers F6 FF 00 00
}

@test "a command that is killed remembers what it gave before, and at a cable with a long name" {
  QORVIO_CABLE=lossy:$(printf '%0300d' 7)
  "$QORVIO" press 'async_out_data[1]' --for 1h 3>&- &
  pid=$!
  catches_interrupt
  until [ -n "$(find qorvio -name '*.json')" ]; do
    kill -0 $pid || return 1
    sleep 0.05
  done
  kill -KILL $pid
  wait $pid || true
  remembers 02 02 00 00
}

@test "a command that fails remembers what it gave before" {
  echo 'async_out_data,sync_out_data[0]' >steps.csv
  for row in {1..9}; do echo "$row,1"; done >>steps.csv
  fails 1 "device 0, user chain 1, core 0: the link is down" play steps.csv
  remembers 04 FF 01 01
}

@test "outputs says by whom and when each was given its value" {
  "$QORVIO" write async_out_data=FF
  sleep 1.1 # the time has seconds
  "$QORVIO" toggle 'async_out_data[3]'
  run "$QORVIO" --json outputs 'async_out_data[0]' 'async_out_data[3]' sync_out_data
  [ "$(jq -c 'map(.last_given)' <<<"$output")" = '["1","0",null]' ]
  [[ $(jq -r '.[0].by' <<<"$output") =~ ^qorvio_lossy,\ process\ [0-9]+$ ]]
  [ "$(jq -r '.[0].by' <<<"$output")" != "$(jq -r '.[1].by' <<<"$output")" ]
  [[ $(jq -r '.[0].at' <<<"$output") < $(jq -r '.[1].at' <<<"$output") ]]
}

@test "a core that another program reads is told of, and free when that one is killed" {
  "$QORVIO" --cable lossy:9999 watch --json >frames 3>&- &
  pid=$!
  tells frames
  run "$QORVIO" --cable lossy:9999 read
  [ "$status" -eq 1 ]
  [[ $output == "qorvio: core 0.1.0 of lossy:9999 is read by qorvio_lossy, process $pid, since 20"* ]]
  "$QORVIO" --cable lossy:9999 write async_out_data=1
  "$QORVIO" --cable lossy:9999 --share read
  kill -KILL $pid
  wait $pid || true
  "$QORVIO" --cable lossy:9999 read
}

@test "toggle needs to know what the output was given, by whom ever" {
  fails 2 "it is not known what this output was last given, say it by --assume 0 or 1: sync_out_data[2]" toggle 'sync_out_data[2]'
  gives 0 'sync_out_data\[2] = 0' toggle 'sync_out_data[2]' --assume 1
  gives 0 'sync_out_data\[2] = 1' toggle 'sync_out_data[2]'
}

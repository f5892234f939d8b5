# Conditions, events and scripts. Needs QORVIO, the tool.

load processes

setup() {
  cd "$BATS_TEST_TMPDIR" || exit 1
  unset QORVIO_CORE QORVIO_SIGNALS
  export QORVIO_CABLE=sim: XDG_STATE_HOME=$PWD
}

@test "wait ends when its conditions are true, or says what it saw last" {
  "$QORVIO" --core 1.1.0 wait 'async_in_data > 0x100' 'sync_in_data moves' --timeout 5s
  run "$QORVIO" wait 'async_in_data == 5' --timeout 20ms
  [ "$status" -eq 1 ]
  [[ $output == "qorvio: not within 20 ms: async_in_data == 5; "*async_in_data* ]]
  run "$QORVIO" wait 'async_in_dat == 5'
  [ "$status" -eq 2 ]
  "$QORVIO" wait 'async_in_data == 5' --timeout 1h 3>&- &
  pid=$!
  catches_interrupt
  kill -TERM $pid
  status=0
  wait $pid || status=$?
  [ "$status" -eq 143 ]
}

@test "events are a line each, with time, value and direction" {
  run "$QORVIO" --core 1.1.0 events async_in_data --count 2
  [ "${#lines[@]}" -eq 2 ]
  [[ ${lines[1]} =~ ^[0-9]+\.[0-9]{6}\ \ async_in_data\ \ 0x[0-9A-F]{4}\ \ ↕$ ]]
  [ -z "$("$QORVIO" events --for 20ms)" ]
  [[ $("$QORVIO" --json --core 1.1.0 events async_in_data --count 1) == '{"time_s":'*'"name":"async_in_data","width":16,'* ]]
}

@test "a script is one session, and stops at its first failure with its line" {
  for port in async_out async_in; do
    printf '[[signal]]\nname = "level"\nport = "%s"\nbits = "7:0"\n' $port
  done >level.toml
  cat >good.qv <<'SCRIPT'
# outputs are looped back on this board
write level=5A --verify
toggle level[0]
expect 'level == 5B' 'level[0] rises'
outputs level
sleep 1ms
echo all "is  well"
SCRIPT
  run "$QORVIO" --signals level.toml run good.qv
  [ "$status" -eq 0 ]
  [ "${lines[*]}" = "level[0] = 1 NAME   LAST GIVEN level  0x5B all is  well" ]
  printf 'write async_out_data=1\n\nexpect async_in_data==2\necho never\n' >bad.qv
  run "$QORVIO" run bad.qv --tap
  [ "$status" -eq 1 ]
  [ "${lines[0]}" = "1..3" ]
  [ "${lines[1]}" = "ok 1 - write async_out_data=1" ]
  [ "${lines[2]}" = "not ok 2 - expect async_in_data==2" ]
  [[ ${lines[3]} == "Bail out! bad.qv:3: not true: async_in_data==2; "* ]]
  while IFS='|' read -r line said; do
    run "$QORVIO" run - <<<"$line"
    echo "$line: exit $status, says: $output"
    [ "$status" -eq 2 ]
    [ "$output" = "qorvio: $said" ]
  done <<'CASES'
frob|stdin:1: no such command in a script: frob
write async_out_data=1FF|stdin:1: async_out_data has 8 bits, too few for the value: 1FF
echo "open|stdin:1: a quote that does not end: "
CASES
}

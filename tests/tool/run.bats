# Conditions, events and scripts. Needs QORVIO, the tool.

load processes

@test "wait ends when its conditions are true, or says what it saw last" {
  "$QORVIO" --core 1.1.0 wait 'async_in_data > 0x100' 'sync_in_data moves' --timeout 5s
  gives 1 'qorvio: not within 20 ms: (async_in_data == 5) && (async_in_data == 0); async_in_data is 0x00' \
    wait 'async_in_data == 5' 'async_in_data == 0' --timeout 20ms
  gives 2 '*' wait 'async_in_dat == 5'
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
  printf '[[device]]\n[[device.core]]\nuser_chain = 1\nindex = 0\ntype = "vio"\nasync_out = 1\n' >mute.toml
  fails 2 "no inputs that could change" --cable sim:mute.toml events
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
  gives 0 $'level\\[0] = 1\nNAME   LAST GIVEN  AT  BY\nlevel  0x5B\nall is  well' --signals level.toml run good.qv
  printf 'write async_out_data=1\n\nexpect async_in_data==2\necho never\n' >bad.qv
  gives 1 $'1..3\nok 1 - write async_out_data=1\nnot ok 2 - expect async_in_data==2\nBail out! bad.qv:3: not true: async_in_data==2; *' \
    run bad.qv --tap
  while IFS='|' read -r line said; do
    fails 2 "$said" run - <<<"$line"
  done <<'CASES'
frob|stdin:1: no such command in a script: frob
write async_out_data=1FF|stdin:1: async_out_data has 8 bits, too few for the value: 1FF
echo "open|stdin:1: a quote that does not end: "
CASES
}

# doctor and play, as typed. Needs QORVIO, the tool.

load processes

@test "doctor finds everything well on the demo board" {
  gives 0 "$(printf 'ok  *\n%.0s' {1..7})"$'\nok       line                 100 status words read, none damaged' doctor
  gives 0 $'*\nok       user registers       hubs at 0.1, 1.1\n*\nok       write and read back  8 bits written and read back\n*' \
    doctor --write
  gives 0 $'*\nok       status word          core 1.1.0, oldest layout, outputs 4 async 4 sync, inputs 16 async 16 sync\n*
ok       write and read back  the design does not loop its outputs back\n*' --core 1.1.0 doctor --write
}

@test "doctor names the step that fails, what it saw, and what to try" {
  printf '[[device]]\nidcode = 0x11\n' >empty.toml
  gives 1 $'FAILED   user registers       no debug hub at any user register: all zeros\n*\nqorvio: the check failed: user registers' \
    --cable sim:empty.toml --quiet doctor
  [ "$("$QORVIO" --cable sim:empty.toml --json doctor 2>&1 | grep -c '"result": "skipped"')" -eq 4 ]
  run "$QORVIO" --cable "sim:$(printf '\377')" --json doctor # JSON for any bytes
  jq . <<<"${output%qorvio:*}" >/dev/null
  printf '[[device]]\nidcode = 0x10\n' >even.toml
  gives 1 'FAILED   idcodes              bit 0 is not 1: 00000010*' --cable sim:even.toml --quiet doctor
  printf 'tcks_per_clock = 0\n[[device]]\n[[device.core]]\nuser_chain = 1\nindex = 0\ntype = "vio"\nsync_in = 4\n' >stopped.toml
  gives 1 $'FAILED   read                 device 0, user chain 1, core 0: design clock stopped, *\n* the clock of the core*' \
    --cable sim:stopped.toml --quiet doctor
  sed 1s/0/200/ stopped.toml >slow.toml
  gives 0 '*4 inputs delivered, CRC right; the design clock is slow: 1 repeat with more room*' --cable sim:slow.toml doctor
  QORVIO=$QORVIO_LOSSY gives 1 "FAILED   line  *the line is noisy: 100 status words took * repeats (no hub's answer *" \
    --cable noisy: --quiet doctor
}

@test "a core that answers at two addresses is found, two cores alike are not" {
  printf '[[device]]\nuser_opcodes = [4, %s]\n' 4 >twice.toml
  core='[[device.core]]\nuser_chain = %s\nindex = 0\ntype = "vio"\nasync_out = 8\nasync_in = 8\nsync_out = 1\ndesign = "loopback"\n'
  printf "$core" 1 >>twice.toml
  gives 1 'FAILED   cores                0.1.0 and 0.2.0 are the same core*user_opcodes*' --cable sim:twice.toml --quiet doctor
  gives 0 '*qorvio: 0.1.0 and 0.2.0 are the same core, see qorvio doctor*' --cable sim:twice.toml scan
  { sed 's/4, 4/4, 5/' twice.toml; printf "$core" 2; cat twice.toml; } >alike.toml  # and the same hub in another device
  gives 1 '*1.1.0 and 1.2.0 are the same core*' --cable sim:alike.toml --quiet doctor
  printf 'write async_out_data=5\nscan\nwrite async_out_data=7\nexpect async_in_data==7\n' >script
  gives 0 '*are the same core*' --cable sim:twice.toml run script
}

@test "play checks a whole table first, then drives it in bursts where it can" {
  { echo 'sync_out_data,sync_out_data[0]'; for i in {1..20}; do echo "$i,1"; done; } >steps.csv
  gives 0 "20 rows in 2 exchanges" play steps.csv
  gives 0 "20 rows in 20 exchanges, * late" play steps.csv --rate 1000
  printf 'async_out_data\n1\n2\n' >levels.csv
  [ "$("$QORVIO" --json play levels.csv | tr -d ' \n')" = '{"rows":2,"exchanges":2,"late":0}' ]
}

@test "play sends rows at their times, in a recording's own columns too" {
  cat >bench.toml <<'TOML'
[[signal]]
name = "level"
port = "async_in"
bits = "7:0"
[[signal]]
name = "level"
port = "async_out"
bits = "7:0"
TOML
  "$QORVIO" --quiet --signals bench.toml record level --samples 5 --rate 50 --out level.csv
  echo 0.1,2,, >>level.csv  # two polls missed at the end
  begin=$(date +%s%N)
  run "$QORVIO" --signals bench.toml play level.csv
  [[ $output == "5 rows in 5 exchanges, "*" late" ]]
  [ $(($(date +%s%N) - begin)) -ge 80000000 ]
  printf 'time_s,sync_out_data\n0,1\n0.3,2\n0.3,3\n' >twice.csv  # the third is due while the second is sent
  [ "$("$QORVIO" --json play twice.csv | tr -d ' \n')" = '{"rows":3,"exchanges":3,"late":1}' ]
  while IFS='|' read -r text said; do
    printf "$text" >bad.csv
    fails 2 "bad.csv:$said" play bad.csv
  done <<'CASES'
sync_out_data\n1\n2FF\n|3: sync_out_data has 8 bits, too few for the value: 2FF
leds\n1\n|1: no output of that name: leds
sync_out_data\n|1: has no row of values below its names
time_s,sync_out_data\n0.2,1\n0.1,2\n|3: a time before that of the row above it: 0.1
time_s,sync_out_data\nsoon,1\n|2: not a time in seconds: soon
time_s,missed\n0,0\n|1: names no output
time_s,missed,sync_out_data\n0\n|2: 1 fields below 3 names
CASES
  fails 2 "the rows have times of their own and take no --rate: twice.csv" play twice.csv --rate 10
}

@test "Ctrl-C ends play between two rows" {
  printf 'time_s,sync_out_data\n0,1\n3600,2\n' >long.csv
  "$QORVIO" play long.csv >told 3>&- &
  pid=$!
  catches_interrupt
  kill -INT $pid
  status=0
  wait $pid || status=$?
  [ "$status" -eq 130 ]
  [[ $(cat told) == [01]" row"*" in "[01]" exchange"*", 0 late" ]]
}

@test "doctor drives no output whose value it cannot give back, unless it is forced to" {
  export QORVIO=$QORVIO_LOSSY QORVIO_CABLE=lossy:999 QORVIO_CORE=0.1.0
  "$QORVIO" toggle 'async_out_data[0]' --assume 0
  gives 1 'FAILED   write and read back  what the outputs were last given is not known; --force drives them and leaves zeros*by qorvio write*' \
    --quiet doctor --write
  "$QORVIO" --quiet doctor --write --force
}

# Recordings, read back by programs that are not ours. Needs QORVIO, the tool; vcd2fst and fst2vcd.

load processes

# The counter of core 1.1.0 has run 21 clocks at the first sample, and 10 more at each that follows.
counted() {
  local sample
  for ((sample = 0; sample < $1; ++sample)); do echo $((21 + 10 * sample)); done
}

@test "a VCD recording contains every value, as an independent reader reports" {
  gives 0 "300 samples in counter.vcd" --core 1.1.0 record async_in_data 'sync_in_data[0]' --samples 300 --out counter.vcd
  vcd2fst counter.vcd counter.fst
  fst2vcd counter.fst >back.vcd
  id=$(awk '/^\$var/ && $5 == "async_in_data" { print $4 }' back.vcd)
  awk -v id="$id" '$2 == id && /^b/ { print substr($1, 2) }' back.vcd |
    while read -r bits; do echo $((2#$bits)); done >values
  diff values <(counted 300)
  # The lowest bit of the counter is 1 at every sample: one change, to 1.
  id=$(awk '/^\$var/ && $5 == "sync_in_data_0_" { print $4 }' back.vcd)
  [ "$(awk -v id="$id" '/^[01]/ && substr($0, 2) == id' back.vcd)" = "1$id" ]
}

@test "CSV and JSON lines contain every sample, with time stamps that only grow" {
  "$QORVIO" --quiet --core 1.1.0 record async_in_data --samples 50 --out counter.csv
  [ "$(head -1 counter.csv)" = "time_s,missed,async_in_data,async_in_data moved" ]
  diff <(tail -n +2 counter.csv | cut -d, -f3) <(counted 50 | xargs printf '0x%04X\n')
  tail -n +2 counter.csv | cut -d, -f1 | sort -C -g
  "$QORVIO" --quiet --core 1.1.0 record async_in_data --samples 50 --out counter.jsonl
  diff <(jq -r '.async_in_data // empty' counter.jsonl) <(counted 50 | xargs printf '0x%04X\n')
}

@test "a trigger keeps the samples around it, and is said in the file" {
  cat >lab.toml <<'TOML'
core = "1.1.0"
[[signal]]
name = "level"
port = "async_in"
bits = "7:0"
scale = 0.5
unit = "V"
[[signal]]
name = "top"
port = "async_in"
bits = 7
enum = { low = 0, high = 1 }
TOML
  export QORVIO_SIGNALS=lab.toml
  "$QORVIO" record --when 'level > 50 V' --before 1 --after 2 --out -.csv | cut -d, -f2- >level.csv
  diff level.csv - <<'CSV'
missed,trigger [level > 50 V],level [V],top,level moved,top moved
0,0,45.5,low,3,0
0,1,50.5,low,3,0
0,0,55.5,low,3,0
0,0,60.5,low,3,0
CSV
  "$QORVIO" record level --when 'level > 50 V' --until top --out level.jsonl
  [ "$(jq -c '.when, .signals[0].unit, .level, .trigger' level.jsonl | xargs)" = \
    "level > 50 V V null null null null 50.5 true null null 55.5 null null null 60.5 null null null 65.5 null" ]
  "$QORVIO" --quiet record level --when 'level > 50 V' --samples 2 --out level.vcd
  grep -qF '$comment trigger: level > 50 V $end' level.vcd
  run "$QORVIO" record --when 'level > 500 V' --for 20ms --out never.csv
  [ "$status" -eq 1 ]
  [ "$output" = "qorvio: not within 20 ms: level > 500 V" ]
}

@test "Ctrl-C ends a recording whose file is whole" {
  "$QORVIO" --core 1.1.0 record --for 1h --rate 100 --out long.csv >told 3>&- &
  pid=$!
  catches_interrupt
  sleep 0.3
  kill -INT $pid
  status=0
  wait $pid || status=$?
  [ "$status" -eq 130 ]
  [[ $(cat told) == "$(grep -c 0x long.csv) samples in long.csv"* ]]
}

@test "what cannot be recorded says why" {
  ln -s /dev/full full.vcd
  fails 1 "cannot write the file full.vcd: No space left on device" record --samples 3 --out full.vcd
  fails 2 "samples go to .vcd, .csv or .jsonl: samples.bin" record --samples 3 --out samples.bin
}

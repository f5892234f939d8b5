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
  [ "$(head -1 counter.csv)" = "time_s,missed,async_in_data" ]
  diff <(tail -n +2 counter.csv | cut -d, -f3) <(counted 50 | xargs printf '0x%04X\n')
  tail -n +2 counter.csv | cut -d, -f1 | sort -C -g
  "$QORVIO" --quiet --core 1.1.0 record async_in_data --samples 50 --out counter.jsonl
  diff <(sed 's/.*"async_in_data":"\(.*\)"}/\1/' counter.jsonl) <(counted 50 | xargs printf '0x%04X\n')
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

# The everyday commands, as typed. Needs QORVIO, the tool, and QORVIO_SOURCES, the sources.

load processes

qorvio() { "$QORVIO" "$@"; }

signals_file() {
  cat >bench.toml <<'TOML'
core = "0.1.0"
[[signal]]
name = "mode"
port = "async_out"
bits = "1:0"
enum = { off = 0, slow = 1, fast = 2 }
[[signal]]
name = "mode"
port = "async_in"
bits = "1:0"
enum = { off = 0, slow = 1, fast = 2 }
[[signal]]
name = "turned"
port = "async_in"
bits = "2:7"
radix = "bin"
[[signal]]
name = "volts"
port = "sync_in"
bits = [3, 2, 1, 0]
radix = "signed"
scale = 0.5
unit = "V"
TOML
}

@test "scan and info report what is on the board" {
  gives 0 "DEVICE  IDCODE    NAME  IR
0       0A5F1093  fpga  6
1       1234567B  cpld  8

CORE   TYPE    VERSION  ASYNC OUT  SYNC OUT  ASYNC IN  SYNC IN
0.1.0  VIO     10.0     8          8         8         8
0.1.1  type 7  10.0     -          -         -         -
1.1.0  VIO     6.1      4          4         16        16" scan
  gives 0 '*"core_major_version": 6,*"async_input_count": 16,*' --json --core 1.1.0 info
}

@test "read shows values in their radix with what moved" {
  gives 0 $'NAME           VALUE  ACTIVITY  SYNC\nasync_in_data  21     ↕' --core 1.1.0 read async_in_data --radix dec
  gives 0 $'NAME*\nsync_in_data\\[0:3]  0b1010  ↕         ↕' --core 1.1.0 read 'sync_in_data[0:3]' --radix bin
}

@test "write takes every spelling of a value, and reports it, in one exchange" {
  signals_file
  run qorvio --signals bench.toml --json write mode=fast 'async_out_data[7:4]=0b1010' 'sync_out_data=0d200' \
    'sync_out_data[0].pulsetrain=0,1,0'
  [ "$status" -eq 0 ]
  [ "$(tr -d ' \n' <<<"$output")" = '[{"name":"mode","width":2,"steps":["2"]},{"name":"async_out_data[7:4]","width":4,"steps":["A"]},{"name":"sync_out_data","width":8,"steps":["C8"]},{"name":"sync_out_data[0]","width":1,"steps":["0","1","0","0","0","0","0","0","0","0","0","0","0","0","0","0"]}]' ]
}

@test "a signals file names, checks and is begun by the tool" {
  signals_file
  gives 0 "4 signals, all fit core 0.1.0" --signals bench.toml signals check
  gives 0 $'NAME*\nmode    off       ·\nturned  0b000000  ·\nvolts   0 V       ·         ·' --signals bench.toml read
  qorvio --core 1.1.0 signals init >first.toml
  gives 0 "4 signals, all fit core 1.1.0" --signals first.toml signals check
  gives 2 "async_in: bit 15 is beyond async_in, which has 8 bits*" --signals first.toml --core 0.1.0 signals check
}

@test "wrong use says what is wrong, and ends with 2" {
  fails 2 "no output of that name (did you mean async_out_data?): asinc_out_data" write asinc_out_data=1
  fails 2 "no output of that name (it is an input): async_in_data" write async_in_data=1
  fails 2 "async_out_data has 8 bits, too few for the value: 1FF" write async_out_data=1FF
  fails 2 "async_out_data has 8 bits: async_out_data[8]" toggle 'async_out_data[8]'
  fails 2 "--width: is 1 to 15, not 0" pulse 'sync_out_data[5]' --width 0
  fails 2 "--samples: is 1 to 1000000000000, not -1" record --samples -1 --out never.csv
  fails 2 "--frames: is 1 to 1000000000000, not 1e23" watch --frames 1e23
  fails 2 "--polls: is 1 to 1000000000, not 0" bench --polls 0
  fails 2 "no such option (did you mean --samples?): --sample" record --sample 1 --out never.csv
  fails 2 "not a core address DEVICE.CHAIN.INDEX: 0.1" --core 0.1 info
  fails 2 "too short a time to record: --for 0.0001us" record --for 0.0001us --out short.csv
  fails 2 "a rate is 0.001 to 1000000000 a second: nan" record --samples 1 --rate nan --out never.csv
  fails 2 "a rate is 0.001 to 1000000000 a second: 1e-12" play never.csv --rate 1e-12
  fails 2 "a rate is 0.001 to 1000000000 a second: 0" watch --rate 0
  fails 2 "cannot open the cable sim:nix.toml: nix.toml: cannot be opened: No such file or directory" \
    --cable sim:nix.toml scan
  fails 2 "--before and --after count from --when, which is not given: record n.csv" record --after 1 --out n.csv
  fails 2 'cannot open the cable demo: the cable URL "demo" has no colon after its kind' --cable demo scan
  fails 2 "no such command (did you mean read?): raed" raed
  signals_file
  fails 2 "bench.toml: the signals are for core 0.1.0, asked for is: 1.1.0" --signals bench.toml --core 1.1.0 read
  sed -i 's/"async_in"/"asynk_in"/' bench.toml
  fails 2 'bench.toml:9: signal[1].port: must be async_out, sync_out, async_in or sync_in, is "asynk_in"' \
    --signals bench.toml read
}

@test "a board that fails says so with the library's words, and ends with 1" {
  fails 1 "no VIO core at 0.1.7, no core is there, see qorvio scan: QorVIO_initCore() for the wrong core type or non-existant core." \
    --core 0.1.7 read
  fails 1 "no VIO core at 0.1.1, a core of type 7 is there, see qorvio scan: QorVIO_getCoreInfo() for the wrong core type or non-existant core." \
    --core 0.1.1 info
}

@test "whole ports, gestures, and settings from environment and file" {
  gives 0 $'*\nasync_in  16     0015   001F  000F' --core 1.1.0 port get async_in
  qorvio port set async_out 5A --mask F0
  qorvio pulse 'sync_out_data[5]' --width 3
  qorvio press 'async_out_data[0]' --for 1ms
  gives 0 'async_out_data\[0] = 1' toggle 'async_out_data[0]'
  echo 'core = "1.1.0"' >qorvio.toml
  gives 0 '*1.1.0*' info
  [[ $(QORVIO_CORE=0.1.0 qorvio info) == *"0.1.0"* ]]
  [[ $(QORVIO_CORE=0.1.0 qorvio --core 1.1.0 info) == *"1.1.0"* ]]
}

@test "a design gives its names to the bits that it connects" {
  cat >top.json <<'JSON'
{"modules": {"top": {"ports": {"go": {"direction": "input", "bits": [2]}, "leds": {"direction": "output", "bits": [5, 6]}},
  "cells": {"vio": {"type": "qor_vio", "connections":
    {"async_in": [5, "0", 9, 10, 11, 13], "async_out": [2], "sync_in": [21, 22, 9]}}},
  "netnames": {"go": {"hide_name": 0, "bits": [2]}, "leds": {"hide_name": 0, "bits": [5, 6]},
    "u.state": {"hide_name": 0, "bits": [8, 9, 10, 11]}, "$auto$1": {"hide_name": 1, "bits": [13]},
    "count": {"hide_name": 0, "bits": [21, 22]}, "u.copy": {"hide_name": 0, "bits": [21, 22]}}}}}
JSON
  qorvio --core 1.1.0 signals from top.json >names.toml
  [ "$(grep -v '^#' names.toml | tr -d '" \n' | sed 's/\[\[signal\]\]name=/ /g; s/port=/,/g; s/bits=/,/g')" = \
    "core=1.1.0 go,async_out,0 leds_0,async_in,0 u_state_3_1,async_in,4:2 async_in_5,async_in,5 count,sync_in,1:0 u_state_1,sync_in,2" ]
  [ "$(qorvio signals from --module top top.json | grep -A1 leds | xargs)" = "name = leds port = async_in" ]
  fails 2 "top.json: has no instance of qor_vio named via" signals from top.json --instance via
  run env PATH=/nowhere "$QORVIO" signals from top.v
  [ "$status" -eq 1 ]
  [[ $output == "qorvio: cannot start yosys: No such file or directory: "* ]]
}

@test "probes lists what OpenOCD could drive, and configures it" {
  mkdir -p usb/1-1 usb/1-2
  echo 0403 | tee usb/1-1/idVendor >usb/1-2/idVendor
  echo 6014 >usb/1-1/idProduct
  echo beef >usb/1-2/idProduct
  printf 'Cable; exit\n' >usb/1-1/product
  echo 'A1; exit' >usb/1-1/serial
  [ "$(qorvio --json probes --sysfs usb | jq -c 'map([.product, .driver, .serial])')" = '[["6014","ftdi","A1; exit"]]' ]
  qorvio probes --sysfs usb --init >my.cfg
  grep -qx 'ftdi vid_pid 0x0403 0x6014' my.cfg
  ! grep -q exit my.cfg
  fails 1 "a configuration needs one adapter that this tool knows, plugged in are: 0" probes --sysfs nix --init
}

@test "a log has each exchange with its bits" {
  qorvio --core 1.1.0 --log log read
  grep -qE '^[0-9.]+ s, took [0-9.]+ s; IR device 1 USER1; DR device 1, [0-9]+ bits, out F+[0-9A-F]+401, in 0[0-9A-F]+1$' log ||
    { cat log; false; }
  qorvio -v --core 1.1.0 read 2>said
  [ "$(wc -l <said)" -eq "$(wc -l <log)" ]
}

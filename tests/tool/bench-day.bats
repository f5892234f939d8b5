# The day of docs/bench-day.md, as it is written there. Needs QORVIO, the tool, and QORVIO_SOURCES, the sources.

BATS_TEST_TIMEOUT=120

@test "a day at the bench goes as its page says" {
  cd "$BATS_TEST_TMPDIR" || exit 1
  unset QORVIO_CORE
  export XDG_STATE_HOME=$PWD PATH="${QORVIO%/*}:$PATH"
  port=$((20000 + $$ % 10000)) # not everybody's 5555
  { echo 'trap '"'"'kill $(jobs -p) 2>/dev/null || true'"'"' EXIT'
    awk '/^```sh$/ { on = 1; next } /^```$/ { on = 0 } on' "$QORVIO_SOURCES/docs/bench-day.md"; } |
    sed "s/5555/$port/g" >day.sh
  grep -q kill day.sh
  bash -euo pipefail day.sh >told 3>&- || { cat told; false; }
  for line in '0.1.0 +VIO .*' '6 signals, all fit core 0.1.0, 1.1.0' 'ok 6 - wait .*' '61 samples in fault.vcd.*' \
    'leds  *0xA  *20.* qorvio, process [0-9]+'; do
    grep -qE "^$line$" told || { echo "no line: $line" && cat told && false; }
  done
  [ "$(awk -F, '$3 == 1' fault.csv | wc -l)" -eq 1 ]
  grep -q '</svg>' fault.svg
  [ "$(sed -n 32p fault.core_1_1_0.level.txt)" = "1F 7.75 V" ]
}

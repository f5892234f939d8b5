# Drawings of recordings. Needs QORVIO, the tool, and QORVIO_SOURCES, the sources.

setup() {
  cd "$BATS_TEST_TMPDIR" || exit 1
  unset QORVIO_CABLE QORVIO_CORE QORVIO_SIGNALS
  cat >small.vcd <<'VCD'
$timescale 1 us $end
$scope module top $end
$var wire 1 ! bit $end
$var wire 1 $ bit_moved $end
$var wire 6 # bus<5:0> $end
$var wire 32 % missed_polls $end
$upscope $end
$enddefinitions $end
#0
$dumpvars
0!
b10 #
0$
b0 %
$end
#250
1!
b1x #
bx %
#500
b101010 #
b11 %
x!
#1000
VCD
}

render() { "$QORVIO_SOURCES/scripts/render-vcd" "$@"; }

draws() {  # draws TEXT...: each of them is part of the drawing
  local text
  for text in "$@"; do
    grep -qF -- "$text" out.svg || { echo "not drawn: $text" && cat out.svg && return 1; }
  done
}

@test "bits are waves, vectors hexadecimal lanes, and what is unknown or missed is hatched" {
  render small.vcd out.svg
  # Names of eight letters leave the lanes 90.4 to 944.
  draws '>bit</text>' 'd="M90.4 44H303.8V22H517.2"' '<rect fill="url(#unknown)" x="517.2" y="22" width="426.8"' \
    '>bus&lt;5:0&gt;</text>' '>02</text>' '>2A</text>' '<rect fill="url(#unknown)" x="303.8" y="56" width="213.4"' \
    'x="303.8" y="16" width="213.4" height="68"><title>polls missed</title>' '>200 µs</text>'
  [ "$(grep -c moved out.svg)" -eq 0 ]
  cp small.vcd width=9.vcd
  render width=9.vcd again.svg
  cmp out.svg again.svg
  render small.vcd out.svg --signals bit_moved,bit --from 0.2ms --to 300us
  draws '>bit_moved</text>' '>bit</text>' 'd="M97.7 78H520.8V56H944.0"' '>200 µs</text>' '>300 µs</text>'
  [ "$(grep -c bus out.svg)" -eq 0 ]
}

@test "a recording is drawn under the names that it was given" {
  "$QORVIO" --quiet --core 1.1.0 record 'async_in_data[3]' sync_in_data --samples 5 --rate 1000 --out counter.vcd
  render counter.vcd out.svg --signals 'async_in_data[3]'
  draws '>async_in_data_3_</text>' 'class="wave"'
}

@test "what cannot be drawn says why and leaves no file" {
  while IFS='|' read -r options said; do
    run render $options
    echo "$options: exit $status, says: $output"
    [ "$status" -eq 2 ]
    [ "$output" = "render-vcd: $said" ]
    [ ! -e bad.svg ]
  done <<'CASES'
small.vcd bad.svg --signals bits|no signal of that name: bits
small.vcd bad.svg --from 2|not a time such as 250us, 10ms or 1.5s: 2
small.vcd bad.svg --from 2ms|nothing between these times: 0.002 s to 0.001 s
none.vcd bad.svg|cannot read the file: none.vcd
/dev/null bad.svg|not a value change dump: /dev/null
small.vcd bad.svg --frm 2ms|no such option: --frm
CASES
}

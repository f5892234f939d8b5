# Drawings of recordings. Needs QORVIO, the tool.

load processes

setup() {
  begin
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

draws() {  # draws TEXT...: each of them is part of the drawing
  local text
  for text in "$@"; do [[ $(cat out.svg) == *"$text"* ]] || { echo "not drawn: $text" && cat out.svg && return 1; }; done
}

@test "bits are waves, vectors hexadecimal lanes, and what is unknown or missed is hatched" {
  umask 077
  "$QORVIO" render small.vcd out.svg
  [ "$(stat -c %a out.svg)" = 600 ]
  # Names of eight letters leave the lanes 90.4 to 944.
  draws '>bit</text>' 'd="M90.4 44H303.8V22H517.2"' '<rect fill="url(#unknown)" x="517.2" y="22" width="426.8"' \
    '>bus&lt;5:0&gt;</text>' '>02</text>' '>2A</text>' '<rect fill="url(#unknown)" x="303.8" y="56" width="213.4"' \
    'x="303.8" y="16" width="213.4" height="68"><title>polls missed</title>' '>200 µs</text>'
  [ "$(grep -c moved out.svg)" -eq 0 ]
  "$QORVIO" render small.vcd out.svg --only bit_moved,bit --from 0.2ms --to 300us
  draws '>bit_moved</text>' '>bit</text>' 'd="M97.7 78H520.9V56H944"' '>200 µs</text>' '>300 µs</text>'
  [ "$(grep -c bus out.svg)" -eq 0 ]
  "$QORVIO" --quiet --core 1.1.0 record 'async_in_data[3]' sync_in_data --samples 5 --rate 1000 --out out.vcd
  "$QORVIO" render out.vcd --only 'async_in_data[3]'
  draws '>async_in_data_3_</text>' 'class="wave"'
}

@test "what is no dump, or would be drawn without end, is refused with its line" {
  while IFS='|' read -r edit options said; do
    sed "$edit" small.vcd >bad.vcd
    # shellcheck disable=SC2086 # a list of options
    fails 2 "$said" render bad.vcd bad.svg $options
    [ ! -e bad.svg ]
  done <<'CASES'
|--only bits|no signal of that name (did you mean bit?): bits
|--from 2|not a time such as 100ms, 10s or 2m: 2
|--from 2ms|nothing to draw between these times: steps 2000 to 1000
1,$d||not a value change dump: bad.vcd
s/^b1x/b<script>/||bad.vcd:18: the digits of a value are 0, 1, x and z: <script>
s/^b1x/r<script>/||bad.vcd:18: not a real number: <script>
s/^b1x/b1111111/||bad.vcd:18: a value wider than its variable: 1111111
s/#1000/#9007199254740992/||bad.vcd:24: a time is a number below 2^53: 9007199254740992
s/#1000/#1e3/||bad.vcd:24: a time is a number below 2^53: 1e3
s/#1000/#100/||bad.vcd:24: a time before the one above it: #100
s/wire 6/wire 999999999/||bad.vcd:5: a width is 1 to 1048576 bits: 999999999
s/^1!/1?/||bad.vcd:17: no variable has this identifier: ?
s/1 us/1 week/||bad.vcd:1: not a timescale such as 10 ns: 1week
/^#1000/a $comment||bad.vcd:25: no $end: $comment
CASES
  sed 's/ bit / <a\&"\x1b> /' small.vcd >out.vcd
  "$QORVIO" render out.vcd
  draws '>&lt;a&amp;&quot;\x1B&gt;</text>'
}

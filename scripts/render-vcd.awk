# The drawing of render-vcd: reads a value change dump, writes SVG. The environment holds its options: signals, from, to; and
# dump, the name of the file.

BEGIN {
  signals = ENVIRON["signals"]; from = ENVIRON["from"]; to = ENVIRON["to"]
  width = 960; margin = 16; laneHeight = 22; laneGap = 12; letter = 7.3
  seconds["s"] = 1; seconds["ms"] = 1e-3; seconds["us"] = 1e-6; seconds["ns"] = 1e-9; seconds["ps"] = 1e-12; seconds["fs"] = 1e-15
  step = 1e-9  # seconds; a dump without a timescale is in nanoseconds
}

{ for (i = 1; i <= NF; i++) token($i) }

END {
  if (bad) exit 2
  if (variables == 0 || stamps == 0) fail("not a value change dump: " ENVIRON["dump"])
  chooseLanes()
  begin = from == "" ? firstTime : stepsOf(from)
  end = to == "" ? time : stepsOf(to)
  if (!(begin < end)) fail("nothing between these times: " begin * step " s to " end * step " s")
  draw()
}

function fail(text) {
  print "render-vcd: " text > "/dev/stderr"
  bad = 1
  exit 2
}

# --- The dump.

function token(text) {
  if (isVector) {  # the second half of a vector's change: its identifier may be any text
    isVector = 0
    change(text, vector)
  } else if (section != "") {
    if (text == "$end") { endSection(); section = "" } else body[++words] = text
  } else if (text ~ /^\$(dump|end$)/) {  # the changes inside are like all others
  } else if (text ~ /^\$/) {
    section = text; words = 0
  } else if (text ~ /^#/) {
    time = substr(text, 2) + 0
    if (stamps++ == 0) firstTime = time
  } else if (text ~ /^[bBrR]/) {
    isVector = 1; vector = tolower(substr(text, 2))
  } else {
    change(substr(text, 2), tolower(substr(text, 1, 1)))
  }
}

function endSection(  text, i) {
  if (section == "$var") {
    variables++
    bits[variables] = body[2] + 0; idOf[variables] = body[3]; nameOf[variables] = body[4]
  } else if (section == "$timescale") {
    for (i = 1; i <= words; i++) text = text body[i]
    step = (text + 0) * seconds[substr(text, match(text, /[a-z]/))]
  }
}

function change(id, value) {
  changes[id]++
  changedAt[id, changes[id]] = time
  changedTo[id, changes[id]] = value
}

# --- What to draw.

# As record spells names in a dump.
function dumpName(name) {
  gsub(/[].:[]/, "_", name)
  return name
}

# Everything, but for what record adds to its signals; that has to be named.
function chooseLanes(  wanted, count, isNamed, i, v) {
  for (v = 1; v <= variables; v++) {
    isNamed[nameOf[v]] = 1
    if (nameOf[v] == "missed_polls") missedId = idOf[v]
  }
  if (signals == "") {
    for (v = 1; v <= variables; v++) {
      if (nameOf[v] == "missed_polls" || (nameOf[v] ~ /_moved$/ && substr(nameOf[v], 1, length(nameOf[v]) - 6) in isNamed))
        continue
      lane[++lanes] = v
    }
  } else {
    count = split(signals, wanted, ",")
    for (i = 1; i <= count; i++) lane[++lanes] = variableNamed(wanted[i])
  }
  for (i = 1; i <= lanes; i++)
    if (length(nameOf[lane[i]]) * letter > nameWidth) nameWidth = length(nameOf[lane[i]]) * letter
  left = margin + nameWidth + margin
}

function variableNamed(name,  v) {
  for (v = 1; v <= variables; v++) if (nameOf[v] == name || nameOf[v] == dumpName(name)) return v
  fail("no signal of that name: " name)
}

# A time such as 10ms, in steps of the dump.
function stepsOf(text,  unit) {
  unit = substr(text, match(text, /[a-z]*$/))
  if (text !~ /^[0-9.]+[a-z]+$/ || !(unit in seconds)) fail("not a time such as 250us, 10ms or 1.5s: " text)
  return (text + 0) * seconds[unit] / step
}

# --- The drawing.

function draw(  i, height) {
  top = margin
  bottom = top + lanes * (laneHeight + laneGap)
  height = bottom + 34
  drawHead(height)
  drawAxis()
  for (i = 1; i <= lanes; i++) drawLane(lane[i], top + (i - 1) * (laneHeight + laneGap) + laneGap / 2)
  if (missedId != "") drawMissed()
  print "</svg>"
}

function drawHead(height) {
  printf "<svg xmlns=\"http://www.w3.org/2000/svg\" viewBox=\"0 0 %d %d\" width=\"%d\" height=\"%d\" role=\"img\">\n", \
    width, height, width, height
  print "<style>"
  print "svg { font: 12px ui-monospace, Menlo, Consolas, 'DejaVu Sans Mono', monospace }"
  print ".card { fill: #ffffff; stroke: #d0d7de } .text { fill: #1f2328 } .faint { fill: #59636e }"
  print ".grid { stroke: #d8dee4 } .wave { fill: none; stroke: #0a6ebd; stroke-width: 1.5 }"
  print ".value { fill: #ddf0ff; stroke: #0a6ebd } .hatch { stroke: #cf222e; stroke-width: 1.5 }"
  print "@media (prefers-color-scheme: dark) {"
  print ".card { fill: #0d1117; stroke: #3d444d } .text { fill: #e6edf3 } .faint { fill: #9198a1 }"
  print ".grid { stroke: #2a3038 } .wave { stroke: #58a6ff } .value { fill: #12283f; stroke: #58a6ff }"
  print ".hatch { stroke: #ff7b72 } }"
  print "</style>"
  print "<defs><pattern id=\"unknown\" width=\"6\" height=\"6\" patternUnits=\"userSpaceOnUse\"" \
    " patternTransform=\"rotate(45)\"><path class=\"hatch\" d=\"M0 0V6\"/></pattern></defs>"
  printf "<rect class=\"card\" x=\"0.5\" y=\"0.5\" width=\"%d\" height=\"%d\" rx=\"6\"/>\n", width - 1, height - 1
}

function x(at) {
  return sprintf("%.1f", left + (at - begin) / (end - begin) * (width - margin - left))
}

# About eight marks, at round times.
function drawAxis(  span, mark, unit, at, n) {
  span = (end - begin) * step
  unit = span >= 2 ? "s" : span >= 2e-3 ? "ms" : span >= 2e-6 ? "us" : "ns"
  mark = roundAbove(span / 8)
  for (n = ceiling(begin * step / mark - 1e-9); (at = n * mark / step) <= end + (end - begin) * 1e-9; n++) {
    printf "<path class=\"grid\" d=\"M%s %dV%d\"/>\n", x(at), top, bottom + 4
    printf "<text class=\"faint\" x=\"%s\" y=\"%d\" text-anchor=\"middle\">%.6g%s</text>\n", x(at), bottom + 20, \
      n * mark / seconds[unit], n == 0 ? "" : " " (unit == "us" ? "µs" : unit)
  }
}

function roundAbove(number,  power) {
  for (power = 1e-15; power * 10 < number; power *= 10) continue
  return power * (number <= power ? 1 : number <= 2 * power ? 2 : number <= 5 * power ? 5 : 10)
}

function ceiling(number) {
  return int(number) + (number > int(number) ? 1 : 0)
}

function drawLane(v, y,  id, k, at, until, value) {
  printf "<text class=\"text\" x=\"%.1f\" y=\"%d\" text-anchor=\"end\">%s</text>\n", left - margin / 2, y + 15, \
    escaped(nameOf[v])
  id = idOf[v]; path = ""; pen = 0
  for (k = 0; k <= changes[id]; k++) {
    at = k == 0 ? begin : changedAt[id, k]
    until = k < changes[id] ? changedAt[id, k + 1] : end
    value = k == 0 ? "x" : changedTo[id, k]
    if (at < begin) at = begin
    if (until > end) until = end
    if (at >= until || (until == end && x(until) - x(at) < 1)) continue
    if (value ~ /[xz]/) drawUnknown(at, until, y)
    else if (bits[v] == 1) extendWave(at, until, y + (value ~ /1$/ ? 0 : laneHeight))
    else drawValue(at, until, y, value, bits[v])
  }
  if (path != "") printf "<path class=\"wave\" d=\"%s\"/>\n", path
}

# A wave is one line, but for where it is unknown.
function extendWave(at, until, y) {
  path = path (pen == at && path != "" ? "V" y : "M" x(at) " " y) "H" x(until)
  pen = until
}

function drawUnknown(at, until, y) {
  printf "<rect fill=\"url(#unknown)\" x=\"%s\" y=\"%d\" width=\"%.1f\" height=\"%d\"/>\n", x(at), y, x(until) - x(at), \
    laneHeight
}

function drawValue(at, until, y, value, count,  a, b, slope, text) {
  a = x(at); b = x(until)
  slope = b - a < 8 ? (b - a) / 2 : 4
  printf "<path class=\"value\" d=\"M%s %dL%.1f %dH%.1fL%s %dL%.1f %dH%.1fZ\"/>\n", a, y + laneHeight / 2, a + slope, y, \
    b - slope, b, y + laneHeight / 2, b - slope, y + laneHeight, a + slope
  text = value ~ /^[01]+$/ ? hexText(value, count) : value
  if (length(text) * letter <= b - a - slope)
    printf "<text class=\"text\" x=\"%.1f\" y=\"%d\" text-anchor=\"middle\">%s</text>\n", (a + b) / 2, y + 15, text
}

function hexText(binary, count,  text, digit, i) {
  while (length(binary) < count || length(binary) % 4 != 0) binary = "0" binary
  for (i = 1; i <= length(binary); i += 4) {
    digit = 8 * substr(binary, i, 1) + 4 * substr(binary, i + 1, 1) + 2 * substr(binary, i + 2, 1) + substr(binary, i + 3, 1)
    text = text substr("0123456789ABCDEF", digit + 1, 1)
  }
  return text
}

function drawMissed(  k, at, until) {
  for (k = 1; k <= changes[missedId]; k++) {
    if (changedTo[missedId, k] !~ /x/) continue
    at = changedAt[missedId, k]; until = k < changes[missedId] ? changedAt[missedId, k + 1] : end
    if (at < begin) at = begin
    if (until > end) until = end
    if (at < until)
      printf "<rect fill=\"url(#unknown)\" opacity=\"0.6\" x=\"%s\" y=\"%d\" width=\"%.1f\" height=\"%d\">" \
        "<title>polls missed</title></rect>\n", x(at), top, x(until) - x(at), bottom - top
  }
}

function escaped(text) {
  gsub(/&/, "\\&amp;", text)
  gsub(/</, "\\&lt;", text)
  gsub(/>/, "\\&gt;", text)
  return text
}

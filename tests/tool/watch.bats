# watch in a terminal, with keys sent and the screen read. Needs QORVIO, the tool, and QORVIO_LOSSY, the tool on a board
# that goes down after N exchanges; tmux.

load processes

teardown() {
  on_screen kill-server 2>/dev/null || true
  [ -z "$pid" ] || kill -KILL "$pid" 2>/dev/null || true
}

on_screen() { tmux -L "qorvio-$$-$BATS_TEST_NUMBER" -f /dev/null "$@"; }
keys() { on_screen send-keys "$@"; }
types() {  # types COMMAND: into a shell, which says how it ended
  on_screen new-session -d -x 100 -y 50 sh
  keys "$1; echo left with \$?" Enter
}

shows() {  # shows REGEX: within ten seconds, a line of the screen
  local try
  for try in {1..100}; do
    on_screen capture-pane -p | grep -qE "$1" && return
    sleep 0.1
  done
  on_screen capture-pane -p
  return 1
}

hides() { ! on_screen capture-pane -p | grep -qE "$1"; }  # hides REGEX: in no line of the screen

@test "keys toggle and pulse outputs, the table follows, and q leaves a clean terminal" {
  types "'$QORVIO' watch --rate 20"
  shows '^async_in_data +0x00 +·'
  shows '^> async_out_data +0x00'
  keys j j Space
  shows '^async_in_data +0x02 +· +↑'
  shows '^> async_out_data\[1\] +0x1'
  keys p
  shows 'plays no pulses, press it instead: async_out_data\[1\]'
  keys k k = q Enter
  shows 'not a value for async_out_data, whose radix is hex: q'
  keys h Enter 5 B C-h A Enter
  shows '^async_in_data +0x5A +.* +↑ +.*▃$'
  for i in {1..10}; do keys j; done
  keys p
  shows '^sync_in_data +0x00 +· +· +↕'
  keys 'C-\' C-z q
  shows 'left with 0'
  [ "$(on_screen capture-pane -p | grep -c 'OUTPUT')" -eq 0 ]
  keys "'$QORVIO' watch" Enter
  shows '^> sync_out_data\[0\]' # as it was left
  shows '^INPUT.* LATEST$'
}

@test "Ctrl-C ends it as cleanly, and without a terminal it prints frames" {
  types "'$QORVIO' watch"
  shows '^async_in_data'
  keys C-c
  shows 'left with 0'
  gives 0 $'*\nasync_in_data  0x001F  ↕               ↕*' --core 1.1.0 watch async_in_data --frames 2 --rate 100 </dev/null
}

@test "lines without room scroll into sight, and a resize redraws all" {
  on_screen new-session -d -x 100 -y 12 "'$QORVIO' watch"
  shows '^14 lines not shown, 0 above and 14 below'
  hides 'sync_out_data\[7\]'
  keys PageDown Down
  shows '^15 lines not shown, 10 above and 5 below'
  hides INPUT
  shows '^> async_out_data ' # the chosen one is always in sight
  keys Up PageUp j j j j j j
  shows '^> async_out_data\[5\]'
  shows '^14 lines not shown, 3 above and 11 below'
  on_screen resize-window -x 100 -y 30
  shows '^INPUT'
  shows '^  sync_out_data\[7\]'
  hides 'not shown'
}

@test "keys do not wait for a frame each where the link is slower than the rate" {
  types "'$QORVIO_LOSSY' --cable slow:99 --core 0.1.0 watch --frames 6"
  keys j j j j j j j j Space # which wait in the terminal until they are read
  shows 'left with 0'
  [[ $(cat qorvio/*.json) == '{"async_out":"80","async_out_known":"80",'* ]]
}

@test "a lost link leaves the last frame on a clean terminal, and ends with 1" {
  types "'$QORVIO_LOSSY' --cable lossy:12 --core 0.1.0 watch --rate 50"
  shows 'link is down; trying again'
  keys q
  shows 'left with 1'
  shows '^async_in_data +0x00'
  shows '^frame 10 '
  shows '^qorvio: device 0, user chain 1, core 0: the link is down'
  [ "$(on_screen display -p '#{alternate_on} #{cursor_flag} #{wrap_flag}')" = "0 1 1" ]
  keys "clear; stty -a" Enter
  shows '(^| )icanon'
  shows '(^| )echo '
}

@test "as JSON a frame is a line, printed until Ctrl-C or until the link is lost" {
  run "$QORVIO_LOSSY" --cable lossy:6 --core 1.1.0 --json watch --rate 100 'sync_in_data[3:0]'
  [ "$status" -eq 1 ]
  [ "${#lines[@]}" -eq 5 ]
  [[ ${lines[0]} == '{"frame":1,"time_s":'* ]]
  [ "${lines[3]#*'"inputs":'}" = '[{"name":"sync_in_data[3:0]","width":4,"value":"3","shown":"0x3","activity_up":"7","activity_down":"F","sync_activity_up":"7","sync_activity_down":"F","activity_up_since_start":"F","activity_down_since_start":"F","sync_activity_up_since_start":"F","sync_activity_down_since_start":"F"}]}' ]
  [ "${lines[4]}" = "qorvio: device 1, user chain 1, core 0: the link is down" ]
  "$QORVIO" --json watch --rate 100 >told 3>&- &
  pid=$!
  tells told
  kill -INT $pid
  wait $pid
  [[ $(tail -1 told) == '{"frame":'*']}' ]]
  "$QORVIO" --json watch --frames 1000000 >told 3>&- &
  pid=$!
  catches_interrupt
  kill -INT $pid
  status=0
  wait $pid || status=$?
  [ "$status" -eq 130 ]
  mkfifo full
  exec {unread}<>full
  head -c 65536 /dev/zero >&$unread  # all that a pipe takes
  "$QORVIO" --json watch >&$unread 3>&- &
  pid=$!
  catches_interrupt
  sleep 0.3
  kill -INT $pid
  wait $pid
}

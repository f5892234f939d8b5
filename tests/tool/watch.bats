# watch in a terminal, with keys sent and the screen read. Needs QORVIO, the tool, and QORVIO_LOSSY, the tool on a board
# that goes down after N exchanges; tmux.

load processes

setup() {
  cd "$BATS_TEST_TMPDIR" || exit 1
  unset QORVIO_CORE QORVIO_SIGNALS
  export QORVIO_CABLE=sim:
  export XDG_STATE_HOME=$PWD
  server=qorvio-$$-$BATS_TEST_NUMBER
}

teardown() {
  tmux -L "$server" kill-server 2>/dev/null || true
  [ -z "$pid" ] || kill -KILL "$pid" 2>/dev/null || true
}

shows() {  # shows REGEX: within ten seconds, a line of the screen
  local try
  for try in {1..100}; do
    tmux -L "$server" capture-pane -p | grep -qE "$1" && return
    sleep 0.1
  done
  tmux -L "$server" capture-pane -p
  return 1
}

hides() { ! tmux -L "$server" capture-pane -p | grep -qE "$1"; }  # hides REGEX: in no line of the screen

@test "keys toggle and pulse outputs, the table follows, and q leaves a clean terminal" {
  tmux -L "$server" -f /dev/null new-session -d -x 100 -y 50 "sh"
  tmux -L "$server" send-keys "'$QORVIO' watch --rate 20; echo left with \$?" Enter
  shows '^async_in_data +0x00 +·'
  shows '^> async_out_data\[0\] +0x0'
  tmux -L "$server" send-keys j Space
  shows '^async_in_data +0x02 +· +↑'
  shows '^> async_out_data\[1\] +0x1'
  tmux -L "$server" send-keys p
  shows 'plays no pulses, press it instead: async_out_data\[1\]'
  for i in {1..7}; do tmux -L "$server" send-keys j; done
  tmux -L "$server" send-keys p
  shows '^sync_in_data +0x00 +· +· +↕'
  tmux -L "$server" send-keys 'C-\' C-z q
  shows 'left with 0'
  [ "$(tmux -L "$server" capture-pane -p | grep -c 'OUTPUT')" -eq 0 ]
}

@test "Ctrl-C ends it as cleanly, and without a terminal it prints frames" {
  tmux -L "$server" -f /dev/null new-session -d -x 100 -y 50 "sh"
  tmux -L "$server" send-keys "'$QORVIO' watch; echo left with \$?" Enter
  shows '^async_in_data'
  tmux -L "$server" send-keys C-c
  shows 'left with 0'
  run "$QORVIO" --core 1.1.0 watch async_in_data --frames 2 --rate 100 </dev/null
  [ "${lines[3]}" = "async_in_data  0x001F  ↕               ↕" ]
}

@test "lines without room scroll into sight, and a resize redraws all" {
  tmux -L "$server" -f /dev/null new-session -d -x 100 -y 12 "'$QORVIO' watch"
  shows '^12 lines not shown, 0 above and 12 below'
  hides 'sync_out_data\[7\]'
  tmux -L "$server" send-keys PageDown Down
  shows '^13 lines not shown, 10 above and 3 below'
  hides INPUT
  shows '^> async_out_data\[0\]' # the chosen one is always in sight
  tmux -L "$server" send-keys Up PageUp j j j j j j
  shows '^> async_out_data\[6\]'
  shows '^12 lines not shown, 3 above and 9 below'
  tmux -L "$server" resize-window -x 100 -y 30
  shows '^INPUT'
  shows '^  sync_out_data\[7\]'
  hides 'not shown'
}

@test "keys do not wait for a frame each where the link is slower than the rate" {
  tmux -L "$server" -f /dev/null new-session -d -x 100 -y 50 "sh"
  tmux -L "$server" send-keys "'$QORVIO_LOSSY' --cable slow:99 --core 0.1.0 watch --frames 6; echo left with \$?" Enter
  tmux -L "$server" send-keys j j j j j j j Space # which wait in the terminal until they are read
  shows 'left with 0'
  [[ $(cat qorvio/*) == '{"async_out":"80","async_out_known":"80",'* ]]
}

@test "a lost link leaves the last frame on a clean terminal, and ends with 1" {
  tmux -L "$server" -f /dev/null new-session -d -x 100 -y 50 "sh"
  tmux -L "$server" send-keys "'$QORVIO_LOSSY' --cable lossy:12 --core 0.1.0 watch --rate 50; echo left with \$?" Enter
  shows 'left with 1'
  shows '^async_in_data +0x00'
  shows '^frame 10 '
  shows '^qorvio: device 0, user chain 1, core 0: the link is down'
  [ "$(tmux -L "$server" display -p '#{alternate_on} #{cursor_flag} #{wrap_flag}')" = "0 1 1" ]
  tmux -L "$server" send-keys "clear; stty -a" Enter
  shows '(^| )icanon'
  shows '(^| )echo '
}

@test "as JSON a frame is a line, told until Ctrl-C or until the link is lost" {
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
  mkfifo full
  exec {unread}<>full
  head -c 65536 /dev/zero >&$unread  # all that a pipe holds
  "$QORVIO" --json watch >&$unread 3>&- &
  pid=$!
  catches_interrupt
  sleep 0.3
  kill -INT $pid
  wait $pid
}

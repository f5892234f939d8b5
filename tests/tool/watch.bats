# watch in a terminal, with keys sent and the screen read. Needs QORVIO, the tool; tmux.

setup() {
  cd "$BATS_TEST_TMPDIR" || exit 1
  unset QORVIO_CABLE QORVIO_CORE QORVIO_SIGNALS
  export XDG_STATE_HOME=$PWD
  server=qorvio-$$-$BATS_TEST_NUMBER
}

teardown() { tmux -L "$server" kill-server 2>/dev/null || true; }

shows() {  # shows REGEX: within ten seconds, a line of the screen
  local try
  for try in {1..100}; do
    tmux -L "$server" capture-pane -p | grep -qE "$1" && return
    sleep 0.1
  done
  tmux -L "$server" capture-pane -p
  return 1
}

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
  tmux -L "$server" send-keys q
  shows '^left with 0'
  [ "$(tmux -L "$server" capture-pane -p | grep -c 'OUTPUT')" -eq 0 ]
}

@test "Ctrl-C ends it as cleanly, and without a terminal it prints frames" {
  tmux -L "$server" -f /dev/null new-session -d -x 100 -y 50 "sh"
  tmux -L "$server" send-keys "'$QORVIO' watch; echo left with \$?" Enter
  shows '^async_in_data'
  tmux -L "$server" send-keys C-c
  shows '^left with 0'
  run "$QORVIO" --core 1.1.0 watch async_in_data --frames 2 --rate 100 </dev/null
  [ "${lines[3]}" = "async_in_data  0x0039  ↕               ↕" ]
}

# Whom the tool believes: settings files and names that others may have written. Needs QORVIO, the tool, and
# QORVIO_SOURCES, the sources.

load processes

setup() { begin && unset QORVIO_CABLE && PATH="${QORVIO%/*}:$PATH"; }

@test "a settings file counts when nobody else could have written it, or what it names" {
  mkdir -p lab/deep
  cd lab
  echo 'exec touch started' >start.cfg
  while IFS='|' read -r setting prepare said; do
    printf "$setting\n" >qorvio.toml
    chmod 644 qorvio.toml start.cfg
    eval "$prepare"
    gives 2 "qorvio: $said" info
    [ ! -e started ]
  done <<'CASES'
cable = "sim:"|chmod 666 qorvio.toml|qorvio.toml is not used, because it could start programs of others: */lab/qorvio.toml can be written by other users
cable = "openocd:?config=start.cfg"|chmod 666 start.cfg|qorvio.toml is not used, *: */lab/start.cfg can be written by other users
cable = "openocd:?timeout=2&config=%%73tart.cfg"|chmod 666 start.cfg|qorvio.toml is not used, *: */lab/start.cfg can be written by other users
cable = "sim:start.cfg"|chmod 666 start.cfg|qorvio.toml is not used, *: */lab/start.cfg can be written by other users
signals = "start.cfg"|chmod 666 start.cfg|qorvio.toml is not used, *: */lab/start.cfg can be written by other users
cabel = "sim:"||qorvio.toml:1: cabel: is no key of this file (did you mean cable?)
cable = "sim:"|export QORVIO_CORE=|must not be empty: QORVIO_CORE
CASES
  unset QORVIO_CORE
  printf 'cable = "sim:"\ncore = "1.1.0"\nsignals = "names.toml"\n' >qorvio.toml
  "$QORVIO" signals init >names.toml
  cd deep # settings are those of the nearest folder above, and its names are relative to it
  [[ $("$QORVIO" signals check) == "4 signals, all fit core 1.1.0" ]]
}

@test "without a cable the simulated board answers, and says so" {
  run "$QORVIO" info
  [ "${lines[0]}" = "qorvio: no cable given: the simulated demo board" ]
  [ "$("$QORVIO" --quiet info 2>&1 | head -1)" = "FIELD                   0.1.0" ]
}

@test "the shell completes names without expanding them, and opens no cable" {
  printf '[[signal]]\nname = "mode"\nport = "async_out"\nbits = 0\nenum = { fast = 1 }\n' >names.toml
  printf '[[signal]]\nname = "m$(touch started)"\nport = "async_out"\nbits = 1\n' >evil.toml
  source "$QORVIO_SOURCES/tools/qorvio/completion/qorvio"
  compopt() { options="$options $*"; }
  export QORVIO_CABLE=rbb:127.0.0.1:1
  while IFS='|' read -r typed offered; do
    read -ra COMP_WORDS <<<"qorvio $typed"
    [[ $typed != *' ' ]] || COMP_WORDS+=('')
    COMP_CWORD=$((${#COMP_WORDS[@]} - 1)) options=
    _qorvio
    echo "$typed: ${COMPREPLY[*]}$options"
    [ "${COMPREPLY[*]}$options" = "$offered" ]
    [ ! -e started ]
  done <<'CASES'
sc|scan
port set |async_out sync_out
--signals names.toml toggle m|mode
--signals = names.toml write m|mode= -o nospace
--signals names.toml write mode = |fast
--signals evil.toml write m|
--signals names.toml read a|async_in_data
--signals n| -o default
--cable sim : b| -o default
read --radix b|bin
watch --fr|--frames
CASES
}

@test "every option and default is in the manual page" {
  "$QORVIO" --man <"$QORVIO_SOURCES/tools/qorvio/man/qorvio.1" >qorvio.1
  [ "$(grep -c '^@' qorvio.1)" -eq 0 ]
  sed 's/\\-/-/g; s/\\f[BIR]//g' qorvio.1 >plain.1
  for command in scan info signals read write pulse toggle press 'port get' 'port set' watch record play doctor \
    bench simulate render; do
    grep -q "^\.SS $command" plain.1 || { echo "no command $command" && return 1; }
    # shellcheck disable=SC2086 # a command may be two words
    for option in $("$QORVIO" $command --help | grep -oE '^ +--[a-z-]+' | grep -v -- --help); do
      grep -qE "^$option( |$)" plain.1 || { echo "$command: no option $option" && return 1; }
    done
  done
  grep -q '(default: 100ms)' plain.1
}

@test "missing standard streams are no files of the tool, and no control sequence reaches the terminal" {
  for closed in '<&-' '>&-' '2>&-' '<&- >&-' '<&- 2>&-' '>&- 2>&-' '<&- >&- 2>&-'; do
    eval "'$QORVIO' record --samples 1 --out one.csv $closed" # it says which board, and how many samples
    [ "$(head -1 one.csv)" = "time_s,missed,async_in_data,sync_in_data,async_in_data moved,sync_in_data moved" ]
    [ "$(wc -l <one.csv)" -eq 2 ]
  done
  run "$QORVIO" --cable "sim:$(printf '\033[31m\233')" info
  [[ $output == *'cable sim:\x1B[31m\x9B'* ]]
  [[ $output != *$'\033'* ]]
}

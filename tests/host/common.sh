# shellcheck shell=bash
# What the tests of the program share. Sourced first: moves into a scratch directory of the test's own, with
# cable locks of its own. TESSEL names the program. A test says `check` for everything that must hold; it
# fails at its end when something did not.

set -euo pipefail

: "${TESSEL:?names the program under test}"

scratch=$(mktemp -d)
cd "$scratch"
export XDG_RUNTIME_DIR=$scratch
export LC_ALL=C
# What a sanitizer finds must not look like a failed session.
export ASAN_OPTIONS=exitcode=99 UBSAN_OPTIONS=exitcode=99:print_stacktrace=1 TSAN_OPTIONS=exitcode=99:atexit_sleep_ms=0

checks=0
failures=0

finish() {
  local status=$?
  cd /
  rm -rf "$scratch"
  if [[ $status -ne 0 ]]; then
    printf 'The test itself ended early with %d.\n' "$status"
  elif [[ $checks -eq 0 || $failures -gt 0 ]]; then
    status=1
  fi
  printf '%d checks, %d failed\n' "$checks" "$failures"
  exit "$status"
}
trap finish EXIT

# run [ARGUMENT...]: runs tessel with the file `in` as standard input, an empty one unless the test wrote it.
# Sets `status` and leaves the files `out` and `err`.
run() {
  [[ -e in ]] || : >in
  status=0
  "$TESSEL" "$@" <in >out 2>err || status=$?
}

# session LINE...: runs a command file of these lines.
session() {
  printf '%s\n' "$@" >session.cmd
  run session.cmd
}

# check DESCRIPTION COMMAND...: the command must succeed.
check() {
  local description=$1
  shift
  checks=$((checks + 1))
  if "$@"; then
    printf 'ok %s\n' "$description"
    return
  fi
  failures=$((failures + 1))
  printf 'not ok %s: %s\n' "$description" "$*"
  show_file out
  show_file err
}

show_file() {
  [[ -s $1 ]] || return 0
  printf '  %s holds:\n' "$1"
  head -c 2000 "$1" | head -n 20 | cut -c 1-200 | cat -v | sed 's/^/    /'
}

exited() { [[ $status -eq $1 ]]; }
# Came to an end of its own, whether the session went well or not.
ended() { [[ $status -eq 0 || $status -eq 1 ]]; }
is_empty() { [[ ! -s $1 ]]; }
# holds FILE TEXT: one of the file's lines is exactly that.
holds() { grep -qxF -e "$2" "$1"; }
# counts NUMBER FILE PATTERN: so many lines of the file fit.
counts() { [[ $(grep -c -a -e "$3" "$2") -eq $1 ]]; }
# is FILE LINE...: the file is exactly these lines.
is() {
  local file=$1
  shift
  diff <(printf '%s\n' "$@") "$file"
}
# The only thing on standard error is this one error.
only_error() { is err "ERROR:tESSEL - $1"; }

# wait_until COMMAND...: until it succeeds; the test fails when that takes more than 20 seconds.
wait_until() {
  local deadline=$((SECONDS + 20))
  until "$@"; do
    [[ $SECONDS -lt $deadline ]] || { printf 'Waited in vain: %s\n' "$*"; return 1; }
    sleep 0.05
  done
}

#!/usr/bin/env bash
# The cable's lock between sessions: held, given back, left behind by a session that died.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

lock=tessel/cable.lock
take=('setMode -bscan' 'setCable -port null')

# Starts a session that holds the cable and waits for lines on descriptor 9.
hold_cable() {
  mkdir -p holder
  rm -f holder/steps.cmd
  mkfifo holder/steps.cmd
  (cd holder && exec "$TESSEL" steps.cmd </dev/null >out 2>err) &
  holder=$!
  exec 9>holder/steps.cmd
  printf '%s\n' "${take[@]}" >&9
  wait_until test -e "$lock"
}

session "${take[@]}" 'info' 'quit'
check 'the cable is open and locked' holds out 'Cable: null, locked'
check 'the lock goes with the session' test ! -e "$lock"

hold_cable
session "${take[@]}" 'quit'
check 'a second session is refused, and told by whom' \
  only_error "The cable is in use by process $holder (lock file $scratch/$lock)."
check 'and what to do' holds out 'Cable is not available. Please try again later.'
check 'and fails' exited 1
session 'cleanCableLock' 'quit'
check 'a lock in use is not cleaned away' exited 1
check 'and stays' test -e "$lock"
printf 'closeCable\n' >&9
wait_until test ! -e "$lock"
session "${take[@]}" 'quit'
check 'a lock that was given back can be taken' exited 0
exec 9>&-
wait "$holder"

hold_cable
# The shell would tell of the killed process.
{
  kill -KILL "$holder"
  wait "$holder" || true
} 2>/dev/null
exec 9>&-
check 'a session that is killed leaves its lock' test -e "$lock"
session "${take[@]}" 'quit'
check 'which stops the next one with a hint' only_error \
  "The cable lock $scratch/$lock was left by process $holder, which has ended. Use cleanCableLock to remove it."
session 'cleanCableLock' "${take[@]}" 'quit'
check 'that helps' exited 0

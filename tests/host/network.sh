#!/usr/bin/env bash
# The network cable against the program tessel-board.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

: "${TESSEL_BUILD:?names the build tree}"
board=$TESSEL_BUILD/bin/tessel-board

# Starts a server on a free port; sets `server` and `server_process`.
start_server() {
  rm -f listening
  "$board" "$@" --listen 127.0.0.1:0 >listening 2>server_err &
  server_process=$!
  wait_until grep -q '^Listening on ' listening
  server=$(sed -n 's/^Listening on //p' listening)
}

stop_server() {
  kill -TERM "$server_process" 2>/dev/null || true
  wait "$server_process" 2>/dev/null || true
}

start_server
session 'setMode -bscan' "setCable -port usb1 -server $server" 'identify' 'info' 'quit'
check 'a session over the network succeeds' exited 0
check 'without an error' is_empty err
check 'and finds the board' holds out "'1': Added device marlin3-4, IDCODE 0x03004FFD, IR length 8"
check 'and says which cable it has' holds out "Cable: server $server, locked"

TESSEL_SERVER=$server session 'setMode -bscan' 'setCable -port auto' 'checkIntegrity' 'quit'
check 'port auto takes the server of the environment' exited 0
check 'and tests the chain there' holds out 'The chain is sound'

session 'setMode -bscan' "setCable -port null -server $server" 'identify' 'program -p 2 -e -v -data 00112233' 'quit'
check 'a PROM is programmed over the network' exited 0
check 'and verified' holds out "'2': Verified 4 bytes"

# Two sessions on one server.
mkdir holder
mkfifo holder/steps.cmd
(cd holder && exec "$TESSEL" steps.cmd </dev/null >out 2>err) &
holder=$!
exec 9>holder/steps.cmd
printf '%s\n' 'setMode -bscan' "setCable -port usb1 -server $server" 'identify' >&9
wait_until grep -q 'Identified 3' holder/out
session 'setMode -bscan' "setCable -port lpt1 -server $server" 'identify' 'quit'
check 'a second session is told that the cable is not available' holds out \
  'Cable is not available. Please try again later.'
check 'and who has it' grep -q "^ERROR:tESSEL - The cable is in use by process $holder " err
check 'and fails' exited 1
session 'setMode -bscan' 'setCable -port null' 'identify' 'quit'
check 'another cable is free' exited 0
exec 9>&-
wait "$holder"
stop_server

session 'setMode -bscan' "setCable -port usb1 -server $server" 'quit'
check 'a server that is gone is named' grep -q "^ERROR:tESSEL - .*$server" err
check 'in one error' counts 1 err '^ERROR'
check 'and the command fails' exited 1
session 'setMode -bscan' 'setCable -port usb1 -server 127.0.0.1:99999' 'quit'
check 'a port that there is not is refused' counts 1 err '^ERROR'
session 'setMode -bscan' 'setCable -port usb1 -server nosuch.invalid:1' 'quit'
check 'a host that there is not is refused' counts 1 err '^ERROR'

# A server that dies in the middle: one error, and the session goes on.
start_server
mkfifo steps.cmd
(exec "$TESSEL" steps.cmd </dev/null >holder/out 2>holder/err) &
holder=$!
exec 9>steps.cmd
printf '%s\n' 'setMode -bscan' "setCable -port usb1 -server $server" 'identify' >&9
wait_until grep -q 'Identified 3' holder/out
stop_server
printf '%s\n' 'readidcode -p 1' >&9
exec 9>&-
wait "$holder" || true
check 'a server that dies gives one error' counts 1 holder/err '^ERROR'
check 'that names it' grep -q "$server" holder/err

# A state file keeps what was programmed, and belongs to one at a time.
printf 'kept' >kept.bin
cat >board.json <<'END'
{"name": "kept", "state": "board.state", "chain": [{"part": "zp18v01"}]}
END
session 'setMode -bscan' 'setCableOption -option board -value board.json' 'setCable -port null' 'identify' \
  'program -p 1 -e -v -file kept.bin' 'quit'
check 'a board with a state file is programmed' exited 0
session 'setMode -bscan' 'setCableOption -option board -value board.json' 'setCable -port null' 'identify' \
  'verify -p 1 -file kept.bin' 'quit'
check 'the next session finds the memory as it was' exited 0
start_server board.json
session 'setMode -bscan' 'setCableOption -option board -value board.json' 'setCable -port null' 'identify' 'quit'
check 'a state that a server has is not available' exited 1
stop_server

#!/usr/bin/env bash
# OpenOCD judges tessel-board: it must find the devices, IDCODEs and instruction registers that the board has, and
# read user codes and registers by its own scans.
#   tests/interop/openocd.sh PATH_OF_TESSEL_BOARD

set -euo pipefail

here=$(dirname "$(realpath "$0")")
board_program=$(realpath "${1:?names tessel-board}")
if ! command -v openocd >/dev/null; then
  echo "openocd is not installed"
  exit 77
fi

scratch=$(mktemp -d)
server=0
finish() {
  local status=$?
  if [[ $server -ne 0 ]]; then kill "$server" 2>/dev/null || true; fi
  cd /
  rm -rf "$scratch"
  exit "$status"
}
trap finish EXIT
cd "$scratch"
export XDG_RUNTIME_DIR=$scratch LC_ALL=C

fail() {
  echo "not ok: $*"
  for file in server.txt openocd.txt; do
    if [[ -e $file ]]; then sed "s/^/$file: /" "$file"; fi
  done
  exit 1
}

cat >board.json <<'BOARD'
{
  "name": "judged",
  "chain": [
    {"part": "marlin3-1"},
    {"part": "zp18v01", "usercode": "CAFE0001"},
    {"part": "mullet-32", "usercode": "12345678"},
    {"bsdl": "minnow8.bsd", "model": {"pages": 8, "bits": 64}}
  ]
}
BOARD
cp "$here/../../examples/boards/parts/minnow8.bsd" .

# judge WORD...: starts the board on a free port for one client, and runs OpenOCD with these options. The TAPs are
# declared before, beginning with the one next to TDO, which is said to have an instruction register of
# `last_length` bits.
judge() {
  : >server.txt
  "$board_program" board.json --listen 127.0.0.1:0 --once >server.txt 2>&1 &
  server=$!
  local port=""
  for _ in $(seq 100); do
    port=$(sed -n 's/^Listening on 127\.0\.0\.1:\([0-9]*\)$/\1/p' server.txt)
    [[ -z $port ]] || break
    sleep 0.1
  done
  [[ -n $port ]] || fail "the board does not listen"
  local mask="-ircapture 0x1 -irmask 0x3"
  timeout 60 openocd \
    -c "gdb_port disabled; tcl_port disabled; telnet_port disabled" \
    -c "adapter driver remote_bitbang; remote_bitbang host 127.0.0.1; remote_bitbang port $port" \
    -c "adapter speed 1000" \
    -c "jtag newtap own tap -irlen $last_length $mask -expected-id 0x00008ffd -ignore-version" \
    -c "jtag newtap cpld tap -irlen 8 $mask -expected-id 0x06020ffd -ignore-version" \
    -c "jtag newtap prom tap -irlen 8 $mask -expected-id 0x05101ffd -ignore-version" \
    -c "jtag newtap fpga tap -irlen 8 $mask -expected-id 0x03001ffd -ignore-version" \
    "$@" >openocd.txt 2>&1
}

# As OpenOCD's -c options: load an instruction in one TAP and print what its data register gives.
read_register() { printf 'irscan %s 0x%x; echo "%s = [drscan %s %d 0]"' "$1" "$2" "$4" "$1" "$3"; }

last_length=5
judge -c "init; scan_chain" \
  -c "$(read_register prom.tap 0x12 32 'prom usercode')" \
  -c "$(read_register cpld.tap 0x12 32 'cpld usercode')" \
  -c "$(read_register fpga.tap 0x12 32 'fpga usercode')" \
  -c "$(read_register own.tap 0x02 32 'own idcode')" \
  -c "$(read_register prom.tap 0x39 8 'prom status')" \
  -c 'irscan prom.tap 0x87; drscan prom.tap 8 0xd0' \
  -c "$(read_register prom.tap 0x39 8 'prom enabled status')" \
  -c "shutdown" || fail "OpenOCD ended with $?"
wait "$server" || fail "the board ended with $?"
server=0

while read -r line; do
  grep -qF -- "$line" openocd.txt || fail "OpenOCD does not say: $line"
  echo "ok: $line"
done <<'LINES'
JTAG tap: fpga.tap tap/device found: 0x03001ffd
JTAG tap: prom.tap tap/device found: 0x05101ffd
JTAG tap: cpld.tap tap/device found: 0x06020ffd
JTAG tap: own.tap tap/device found: 0x00008ffd
prom usercode = cafe0001
cpld usercode = 12345678
fpga usercode = ffffffff
own idcode = 00008ffd
prom status = 00
prom enabled status = 08
LINES
if grep -qE "^(Error|Warn : .*(IR|UNEXPECTED))" openocd.txt; then fail "OpenOCD complains"; fi

# OpenOCD itself notices when an instruction register is not as long as it was told.
last_length=6
judge -c "init; shutdown" || true
wait "$server" || fail "the board ended with $?"
server=0
grep -qE "IR capture|IR length" openocd.txt || fail "OpenOCD accepts a wrong length of the instruction register"
echo "ok: instruction registers have the lengths that were told"

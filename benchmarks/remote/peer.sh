#!/usr/bin/env bash
# The time that OpenOCD's remote_bitbang client takes for 1 MiB of compared data, on a board that tessel-board serves:
#   benchmarks/remote/peer.sh TESSEL_BOARD
set -euo pipefail

board=${1:?names the program tessel-board}
command -v openocd >/dev/null || { echo 'openocd is not installed'; exit 0; }
scratch=$(mktemp -d)
server=0
trap 'kill "$server" 2>/dev/null || true; rm -rf "$scratch"' EXIT

"$board" --listen 127.0.0.1:0 >"$scratch/listening" &
server=$!
for _ in $(seq 100); do
  grep -q Listening "$scratch/listening" && break
  sleep 0.05
done
port=$(sed -n 's/.*://p' "$scratch/listening")

# 128 scans of 64 Kbit through BYPASS: zeros come out again.
zeros=$(printf '0%.0s' $(seq 16384))
{
  printf 'TRST OFF;\nSTATE RESET;\nSIR 24 TDI (FFFFFF);\n'
  for _ in $(seq 128); do
    printf 'SDR 65536 TDI (%s)\n TDO (%s);\n' "$zeros" "$zeros" | fold -w 250
    printf '\n'
  done
} >"$scratch/zeros.svf"

play() {
  openocd -c 'adapter driver remote_bitbang' -c "remote_bitbang port $port" -c 'remote_bitbang host 127.0.0.1' \
    -c 'jtag newtap a tap -irlen 8 -ignore-bypass -expected-id 0' -c 'jtag newtap b tap -irlen 8 -expected-id 0' \
    -c 'jtag newtap c tap -irlen 8 -expected-id 0' -c 'noinit' -c 'init' -c "$1" -c shutdown >"$scratch/log" 2>&1
}
milliseconds() { echo $(($(date +%s%N) / 1000000)); }

begin=$(milliseconds)
play 'sleep 1' || true
middle=$(milliseconds)
play "svf $scratch/zeros.svf" || { tail -n 5 "$scratch/log"; exit 1; }
end=$(milliseconds)
grep -q 'svf file programmed successfully' "$scratch/log" || { tail -n 5 "$scratch/log"; exit 1; }
printf 'OpenOCD: compare 1 MiB in scans of 8 KiB: %d ms (%d ms of start taken off)\n' \
  $((end - middle - (middle - begin))) $((middle - begin))

#!/usr/bin/env bash
# Builds the release preset and measures whole runs of tessel (lines a second, memory, start-up), the simulated board
# behind its protocol, and the network cable. With --peers it first installs two JTAG shells from Debian, whose
# cheapest command, and the network client of one of them, are then measured in the same run.
#   scripts/benchmark.sh [--peers] [LINES]
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

peers=()
if [[ ${1:-} == --peers ]]; then
  peers=(urjtag openocd)
  shift
fi
install_missing "${build_packages[@]}" "${peers[@]}"
build_preset release tessel-benchmark tessel-benchmark-board tessel-benchmark-remote tessel-board
built=$root/build/release/bin
"$built/tessel-benchmark" "$@"
"$built/tessel-benchmark-board"
"$built/tessel-benchmark-remote"
[[ ${#peers[@]} -eq 0 ]] || "$root/benchmarks/remote/peer.sh" "$built/tessel-board"

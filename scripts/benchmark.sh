#!/usr/bin/env bash
# Builds the release preset and measures whole runs of tessel: lines a second, memory, start-up. With --peers it
# first installs two JTAG shells from Debian, whose cheapest command is then measured in the same run.
#   scripts/benchmark.sh [--peers] [LINES]
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

peers=()
if [[ ${1:-} == --peers ]]; then
  peers=(urjtag openocd)
  shift
fi
install_missing "${build_packages[@]}" "${peers[@]}"
build_preset release tessel-benchmark
"$root/build/release/bin/tessel-benchmark" "$@"

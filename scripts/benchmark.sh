#!/usr/bin/env bash
# Builds tessel as users get it and measures it; benchmarks/ tells what. A number as argument is how many lines
# the workloads have.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

install_missing "${build_packages[@]}"
build_preset release tessel-benchmark
say "Measuring"
"$root/build/release/bin/tessel-benchmark" "$@"

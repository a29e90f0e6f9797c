#!/usr/bin/env bash
# Builds the property tests of the release preset and runs them at length: so many programming runs on random chains
# with random faults (10000 unless said otherwise), and so many with a connection that is cut (a tenth of that).
#   scripts/properties.sh [ROUNDS [SEED]]
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

rounds=${1:-10000}
seed=${2:-$RANDOM}
install_missing "${build_packages[@]}"
build_preset release tessel-program-property tessel-drop-property
say "$rounds programming runs on random chains, seed $seed"
"$root/build/release/bin/tessel-program-property" --rounds "$rounds" --seed "$seed"
say "$((rounds / 10)) connections cut, seed $seed"
"$root/build/release/bin/tessel-drop-property" --rounds "$((rounds / 10))" --seed "$seed"

#!/usr/bin/env bash
# Builds a preset (dev unless another is named) and runs its tests. Words behind the preset go to ctest:
#   scripts/test.sh
#   scripts/test.sh tsan -L 'threads|conformance'
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

preset=${1:-dev}
[[ $# -eq 0 ]] || shift

install_missing "${build_packages[@]}" "${interop_packages[@]}"
# The thread sanitizer's fixed memory layout and a kernel that scatters addresses widely do not go together;
# the build counts, too, for it asks the test programs for their tests.
if [[ $preset == tsan && -z ${TESSEL_FIXED_ADDRESSES:-} ]] && setarch --addr-no-randomize true 2>/dev/null; then
  TESSEL_FIXED_ADDRESSES=1 exec setarch --addr-no-randomize "$root/scripts/test.sh" "$preset" "$@"
fi
build_preset "$preset"
say "Testing preset $preset"
cd "$root"
ctest --preset "$preset" "-j$(nproc)" --no-tests=error "$@"

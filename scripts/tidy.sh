#!/usr/bin/env bash
# Runs clang-tidy over the C++ files of the tree that preset dev compiles, or over those whose path holds one of the given
# texts. The checks stand in .clang-tidy; each finding is an error.
#   scripts/tidy.sh
#   scripts/tidy.sh batch/settings portability/Stream.cpp
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

# The first version of Debian 12 that knows all of the language that we use.
tidy=clang-tidy-16

install_missing "${build_packages[@]}" "$tidy"
say "Configuring preset dev"
cmake -S "$root" --preset dev >/dev/null

wanted=(-e "$root/")
if [[ $# -gt 0 ]]; then
  wanted=()
  for text in "$@"; do wanted+=(-e "$text"); done
fi
mapfile -t files < <(sed -n 's/^  "file": "\(.*\)",\{0,1\}$/\1/p' "$root/build/dev/compile_commands.json" |
  sort -u | grep -vF "$root/build/" | grep -F "${wanted[@]}")
[[ ${#files[@]} -gt 0 ]] || fail "No file of preset dev fits: $*"

say "$tidy on ${#files[@]} files"
printf '%s\0' "${files[@]}" | xargs -0 -n 1 -P "$(nproc)" "$tidy" -p "$root/build/dev" --quiet 2>&1 |
  { grep -v 'warnings generated\.$' || true; }

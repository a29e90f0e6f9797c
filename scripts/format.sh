#!/usr/bin/env bash
# Checks the layout of every C++ file against .clang-format; with --fix it rewrites those that differ.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

mode=(--dry-run -Werror)
case ${1:-} in
  '') ;;
  --fix) mode=(-i) ;;
  *) fail "Unknown argument $1, expected --fix or nothing" ;;
esac

install_missing clang-format-14
cd "$root"
source_files '*.h' '*.cpp' | xargs -0 clang-format-14 "${mode[@]}"

#!/usr/bin/env bash
# Builds tessel as users get it and runs examples/quickstart.cmd in a scratch directory, on a bitstream made for it.
# Shows the lines, what they print and what the session leaves behind; fails when the session fails.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

install_missing "${build_packages[@]}"
build_preset release tessel tessel-board

scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
cp "$root/examples/quickstart.cmd" "$scratch"
cd "$scratch"
# A lock of its own: whoever holds the user's cable does not stop the demo.
export XDG_RUNTIME_DIR=$scratch

show() {
  say "$1"
  sed 's/^/  /' "$2"
}

show "The command file quickstart.cmd" quickstart.cmd
say "A bitstream for it"
"$root/build/release/bin/tessel-board" --bitstream marlin3-4 top.bit --usercode C0FFEE01
say "tessel quickstart.cmd"
status=0
"$root/build/release/bin/tessel" quickstart.cmd </dev/null || status=$?
say "What was read back from the flash, in flash.mcs"
head -n 3 flash.mcs
show "The steps it recorded, in _tesselbatch.cmd" _tesselbatch.cmd
say "Exit code $status"
exit "$status"

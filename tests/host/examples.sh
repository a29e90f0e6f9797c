#!/usr/bin/env bash
# The examples do what their texts and the README say.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

: "${TESSEL_SOURCE:?names the source tree}" "${TESSEL_BUILD:?names the build tree}"

cp "$TESSEL_SOURCE/examples/quickstart.cmd" .
"$TESSEL_BUILD/bin/tessel-board" --bitstream marlin3-4 top.bit --usercode C0FFEE01 >/dev/null
run quickstart.cmd
check 'the quickstart succeeds' exited 0
check 'without an error' is_empty err
check 'it shows how far it is' grep -qa ' 100%' out
# As a terminal shows it: a percentage is overwritten by what follows. Seconds are the machine's.
sed -e 's/.*\r\f//' -e '/^$/d' -e 's/\(Elapsed time = *\)[0-9]* sec/\10 sec/' out >seen
mv seen out
# The README shows the output between two marks, in a block of code.
sed -n '/^<!-- quickstart output -->$/,/^<!-- end -->$/p' "$TESSEL_SOURCE/README.md" | sed '/^<!--/d; /^```/d' >shown
check 'the README shows its output' diff shown out
check 'which is some' test -s shown

status=0
"$TESSEL_BUILD/bin/embed" quickstart.cmd </dev/null >out 2>err || status=$?
sed -i '/^$/d' out  # progress begins with a line break past all message managers
check 'a program that embeds the interpreter runs it' is out 'went well'
check 'and sees that it went well' exited 0
printf 'repeatEnd\nnosuch\n' >failing.cmd
status=0
"$TESSEL_BUILD/bin/embed" failing.cmd </dev/null >out 2>err || status=$?
check 'it gets the problems' is out 'problem: tESSEL - Missing repeatStart command' \
  'problem: tESSEL - Invalid command, nosuch.' 'failed'
check 'in place of standard error' is_empty err
check 'and sees that it failed' exited 1

printf '%s\n' 'setMode -bscan' 'setCable -port usb1' 'info' 'quit' >own.cmd
status=0
LD_LIBRARY_PATH=$TESSEL_BUILD/lib/printing "$TESSEL" own.cmd </dev/null >out 2>err || status=$?
check 'another device manager takes the place of the bundled one' is out 'device manager: setMode' \
  'device manager: setCable' 'device manager: lockCable' 'device manager: info' \
  'device manager: unlockCable' 'device manager: closeCable'
check 'and the session succeeds' exited 0

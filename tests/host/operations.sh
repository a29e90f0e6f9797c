#!/usr/bin/env bash
# The examples of docs/operations.md are one session: it prints what the page says.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

: "${TESSEL_SOURCE:?names the source tree}" "${TESSEL_BUILD:?names the build tree}"
page=$TESSEL_SOURCE/docs/operations.md

"$TESSEL_BUILD/bin/tessel-board" --bitstream marlin3-4 top.bit --usercode C0FFEE01 >/dev/null
sed -n '/^```console$/,/^```$/p' "$page" | sed '/^```/d' >shown
# Each line is a session's: one that fails would end the command file, but not the prompt.
{
  printf '%s\n' 'setMode -bscan' 'setCable -port null'
  sed -n 's/^> //p' shown
  printf 'quit\n'
} >in
status=0
"$TESSEL" --no-log <in >printed 2>&1 || status=$?
# Without the prompt, what the first two lines print (nothing), and the times.
sed -e 's/^>*//' -e '/^Elapsed time = /d' -e '/^ *$/d' printed >got
grep -v '^> ' shown >wanted
check 'the page shows what the words print' diff wanted got
check 'which is a lot' test "$(wc -l <wanted)" -gt 80

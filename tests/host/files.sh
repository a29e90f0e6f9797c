#!/usr/bin/env bash
# Command files that are not there, cannot be read, or go away.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

run missing.cmd
check 'a missing file gives one error' only_error 'File missing.cmd may not exist'
check 'and fails' exited 1

mkdir directory
run directory
check 'a directory gives one error' only_error 'File directory may not exist'
check 'and fails' exited 1

if [[ -r /proc/self/mem ]]; then
  run /proc/self/mem
  check 'a read error names the file and the reason' only_error 'Read error in file /proc/self/mem: Input/output error'
  check 'and fails' exited 1
fi

# Root reads everything, so the test gives that up for this one, where it can and the program stays in reach.
printf 'quit\n' >closed.cmd
chmod 000 closed.cmd
as_nobody=()
[[ $(id -u) -ne 0 ]] || as_nobody=(setpriv --reuid=65534 --regid=65534 --clear-groups)
chmod 755 .
if "${as_nobody[@]}" "$TESSEL" --version >/dev/null 2>&1; then
  status=0
  "${as_nobody[@]}" "$TESSEL" --no-log "$PWD/closed.cmd" </dev/null >out 2>err || status=$?
  check 'an unreadable file gives one error' only_error "File $PWD/closed.cmd may not exist"
  check 'and fails' exited 1
else
  echo 'skipped: an unreadable file, for nobody cannot run the program here'
fi

mkfifo early.cmd
printf 'setMode -bscan\nhelp -m quit' >early.cmd &
run early.cmd
wait
check 'a FIFO whose writer goes away ends like a file' counts 1 out '^quit: '
check 'and succeeds' exited 0
: >early.cmd &
run early.cmd
wait
check 'a FIFO that never gives a line is an empty file' test "$(<out)" = '>'

# Another session holds the cable; meanwhile this one waits in the middle of a file longer than its buffer.
mkdir holder
mkfifo holder/steps.cmd
(cd holder && exec "$TESSEL" steps.cmd </dev/null >out 2>err) &
exec 9>holder/steps.cmd
printf 'setMode -bscan\nsetCable -port null\n' >&9
wait_until test -e tessel/cable.lock
{
  printf 'setMode -bscan\nsetPreference -pref cableLockTries:200\nsetCable -port null\n'
  yes '# a comment that fills the file beyond the first buffer' | head -n 5000 || true
  printf 'help -m quit\nquit\n'
} >removed.cmd
status=0
"$TESSEL" removed.cmd </dev/null >out 2>err 9>&- &
waiting=$!
wait_until grep -qs cableLockTries _tesselbatch.cmd
rm removed.cmd
exec 9>&-
wait "$waiting" || status=$?
wait
check 'a file that is removed while it runs runs to its end' counts 1 out '^quit: '
check 'without an error' is_empty err
check 'and succeeds' exited 0

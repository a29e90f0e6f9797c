#!/usr/bin/env bash
# Where lines come from: a file, a pipe, standard input, the prompt. Every line runs once.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

# More than any buffer holds at a time.
line='help -m quit'
many=20000
yes "$line" | head -n "$many" >many.cmd || true
answer='^quit: '

run many.cmd
check 'a file runs every line once' counts "$many" out "$answer"
check 'and then goes on at the prompt' test "$(tail -n 1 out)" = '>'
check 'and succeeds' exited 0

cp many.cmd in
run -
check 'a file as standard input runs every line once' counts "$many" out "$answer"
check 'and leaves nothing to the prompt' counts 1 out '>'

run
check 'so does the prompt' counts "$many" out 'quit: '
check 'with a prompt before each line and at the end' test "$(tr -cd '>' <out | wc -c)" -eq $((many + 1))
rm in

status=0
cat many.cmd | "$TESSEL" - >out 2>err || status=$?
check 'a pipe runs every line once' counts "$many" out "$answer"
check 'a pipe ends the session' exited 0

printf '%s\n' "$line" quit "$line" >in
run -
check 'what follows quit does not run' counts 1 out "$answer"
printf '%s\n' 'setMode -nosuch' "$line" >in
run -
check 'what follows a line that failed does not run' is_empty out
check 'and the session fails' exited 1
rm in

printf '%s' "$line" >file.cmd
run file.cmd
check 'a last line without a line end runs' counts 1 out "$answer"
printf '%s\r\n' "$line" "$line" quit >file.cmd
run file.cmd
check 'line ends of the other kind do' counts 2 out "$answer"
check 'and quit is understood' exited 0
: >file.cmd
run file.cmd
check 'an empty file leads to the prompt' test "$(<out)" = '>'
mkdir 'a place with blanks'
printf '%s\nquit\n' "$line" >'a place with blanks/a file.cmd'
run 'a place with blanks/a file.cmd'
check 'a path may hold blanks' counts 1 out "$answer"

printf '%s\n' "$line" 'repeatEnd' "$line" 'nosuch' >file.cmd
status=0
"$TESSEL" file.cmd >both 2>&1 </dev/null || status=$?
sed -n '/^quit: /p; /^WARNING/p; /^ERROR/p' both >order
check 'output and errors in one file keep their order' is order 'quit: Ends the session.' \
  'WARNING:tESSEL - Missing repeatStart command' 'quit: Ends the session.' 'ERROR:tESSEL - Invalid command, nosuch.'
printf '%s\n' "$line" 'nosuch' "$line" >in
"$TESSEL" <in >both 2>&1
grep -o -e '^>*quit: ' -e 'ERROR.*' both >order
check 'at the prompt, too' is order '>quit: ' 'ERROR:tESSEL - Invalid command, nosuch.' '>quit: '

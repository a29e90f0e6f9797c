#!/usr/bin/env bash
# Options, exit codes and the list of words.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

run --version
check 'the version is a line of its own' grep -qxE 'tessel [0-9]+\.[0-9]+\.[0-9]+' out
check 'asking for the version succeeds' exited 0

run --help
check 'asking for help succeeds' exited 0
for word in FILE --no-log --words --version; do
  check "help tells of $word" grep -q -e "$word" out
done

run --no-such-option
check 'an unknown option is a wrong usage' exited 2
check 'and is named' grep -q -e --no-such-option err
check 'and nothing runs' is_empty out

run one.cmd two.cmd
check 'a second file is a wrong usage' exited 2
check 'and nothing of it runs' is_empty out

run ''
check 'an empty file name is no prompt' only_error 'File  may not exist'

run
check 'a prompt without input succeeds' exited 0
check 'and is one prompt' test "$(<out)" = '>'

session 'setMode -bscan' 'quit'
check 'a session that goes well succeeds' exited 0
session 'setMode -bscan' 'setMode -nosuch' 'quit'
check 'a line that fails ends the session with 1' exited 1
printf 'setMode -nosuch\n' >in
run
check 'the last line at the prompt decides: failed' exited 1
printf 'setMode -nosuch\nsetMode -bscan\n' >in
run
check 'the last line at the prompt decides: went well' exited 0
rm in

run --words
check 'the list of words succeeds' exited 0
check 'it holds setMode' holds out setMode
tr '[:upper:]' '[:lower:]' <out >lowered
check 'it is sorted, whatever the case of letters, and names each once' sort -u -c lowered
mv out words
session 'help -all' 'quit'
check 'help lists the same words' diff words out

#!/usr/bin/env bash
# The batch log and the batch-command file, also where they cannot be written.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

lines=('setMode -bscan' 'help -m quit' 'repeatEnd' 'nosuch')
log=_tesselbatch.log
steps=_tesselbatch.cmd

session "${lines[@]}"
check 'the log begins with the version' grep -q '^tESSEL Version: ' "$log"
check 'and the time' grep -q '^tESSEL log file Started on ' "$log"
for text in 'quit: Ends the session.' 'WARNING:tESSEL - Missing repeatStart command' \
  'ERROR:tESSEL - Invalid command, nosuch.'; do
  check "the log holds: $text" holds "$log" "$text"
done
session 'quit'
check 'the next session starts the log afresh' counts 0 "$log" nosuch

rm "$log"
run --no-log session.cmd
check 'without a log wanted there is none' test ! -e "$log"
printf 'help -m quit\n' >in
run
check 'the prompt alone keeps no log' test ! -e "$log"
rm in

rm -f "$steps"
session "${lines[@]}"
cp out shown
cp err told
rm "$log" "$steps"
for place in /dev/full /nowhere/at/all; do
  ln -s "$place" "$log"
  session "${lines[@]}"
  check "a log in $place changes nothing on standard output" diff shown out
  check "and nothing on standard error, log in $place" diff told err
  check "and not the result, log in $place" exited 1
  rm "$log"
done
mkdir "$log"
session "${lines[@]}"
check 'a log that is a directory changes nothing' diff told err
rmdir "$log"

rm -f "$steps"
session 'setMode -bscan' 'setPreference -pref lineWidth:100' 'setPreference -pref recordSteps:false' 'setMode -spi' 'quit'
check 'steps are recorded as long as they are wanted' \
  is "$steps" 'setMode -bscan' 'setPreference -pref lineWidth:100' 'quit'
session 'setMode -bscan' 'quit'
check 'a second session adds to them' counts 2 "$steps" '^setMode -bscan$'

rm "$steps"
ln -s /dev/full "$steps"
session 'setMode -bscan' 'setMode -spi' 'setMode -pff' 'quit'
check 'a full disk gives one error' counts 1 err '^ERROR:tESSEL - Batch-command file _tesselbatch.cmd '
check 'that tells the reason' grep -q 'No space left on device' err
check 'and nothing else' counts 1 err ''
check 'and the session goes on' exited 0
rm "$steps"
mkdir "$steps"
session 'setMode -bscan' 'setMode -spi' 'quit'
check 'a directory in its place gives one error' counts 1 err '^ERROR:tESSEL - Batch-command file _tesselbatch.cmd '
check 'and the session goes on, too' exited 0

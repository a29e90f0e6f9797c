#!/usr/bin/env bash
# Files that nobody would write. Each session comes to its end by itself, with one clear error where one is due.
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

# both DESCRIPTION FILE: runs the file as a command file and at the prompt, where failing lines do not end it.
both() {
  run "$2"
  check "$1, as a command file" ended
  ln -f "$2" in
  run
  check "$1, at the prompt" ended
  rm in
}

# hostile_bytes COUNT: the same bytes at each run, zero bytes and line ends among them.
hostile_bytes() {
  printf '%b' "$(awk -v count="$1" 'BEGIN {
    state = 20231
    for (i = 0; i < count; ++i) {
      state = (state * 16807) % 2147483647
      printf "\\0%03o", int(state / 256) % 256
    }
  }')"
}

head -c 100000000 /dev/zero | tr '\0' 'x' >long
both '100 MB without a line end' long
run long
check 'gives one error' counts 1 err '^ERROR:tESSEL - Invalid command, xxx'
check 'and no other output' counts 1 err ''
rm long out err

printf 'setMode -bscan\n\0\0\0\nhelp -m quit\nhe\0lp\n' >zeros
both 'zero bytes' zeros
printf 'help -m quit\n\0\nhelp -m quit\n' >in
run
check 'lines around zero bytes run' counts 2 out 'quit: '
rm in

hostile_bytes 200000 >bytes
check 'the bytes are what they should be' test "$(wc -c <bytes)" -eq 200000
both 'arbitrary bytes' bytes

{ printf 'help'; yes ' a' | head -n 100000 | tr -d '\n'; printf '\n'; } >words || true
both 'a line of 100,000 words' words
run words
check 'gives one error' counts 1 err '^ERROR:tESSEL - Unexpected word a after help'

{ printf 'help -m '; head -c 1000000 /dev/zero | tr '\0' 'y'; printf '\n'; } >word
both 'a word of 1 MB' word
{ head -c 1000000 /dev/zero | tr '\0' '"'; printf '\n'; } >quotes
both '1 MB of quotes' quotes

# Texts that are printf formats are texts.
formats=('%s%s%s%s%s%s' '%n%n%n%n' '%d%x%p' '%s%n%d' '%1000000000d' '%.1000000000s' '%*d%*.*f' '%ls%hhn%Lf' '%' '%%')
for text in "${formats[@]}"; do
  session "$text"
  check "$text as a command word" only_error "Invalid command, $text."
  check "$text in the log" holds _tesselbatch.log "ERROR:tESSEL - Invalid command, $text."
  session "help -$text"
  check "$text as a switch" grep -qF -e "Unknown switch -$text of help" err
  check "$text as a switch is one error" counts 1 err '^ERROR'
  session "help -m \"$text\""
  check "$text as an argument" grep -qF "Can't match this command" out
  session "setMode -$text"
  check "$text as a mode" only_error "Unknown mode $text."
  run "$text"
  check "$text as the file to run" only_error "File $text may not exist"
  session 'setMode -bscan' "setCable -port svf -file \"$text.svf\""
  check "$text as a file name" grep -qF -e "Cable $text.svf can't be opened" err
  session "setPreference -pref \"lineWidth:$text\""
  check "$text as a value" grep -qF -e "can't be \"$text\"" err
  session "setEnv -env \"A$text\" -value \"$text\"" quit
  check "$text in the environment" exited 0
done

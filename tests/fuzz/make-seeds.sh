#!/usr/bin/env bash
# Makes the dictionaries anew, and for each fuzzer the seed corpus: inputs out of the conformance cases and the
# commands' examples, of which those stay that reach something more than the others.
#   tests/fuzz/make-seeds.sh          after a build of preset fuzz
source "$(dirname "${BASH_SOURCE[0]}")/../../scripts/common.sh"

fuzz=$root/tests/fuzz
bin=$root/build/fuzz/bin
[[ -x $bin/SessionFuzzer ]] || fail "Build first: cmake --preset fuzz && cmake --build build/fuzz"

scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
cd "$scratch"
mkdir Lines Table Pdr Session

"$bin/tessel" --words >words
{ sed 's/^/help -m /' words && echo quit; } >help.cmd
"$bin/tessel" --no-log help.cmd >help
sed -n 's/^Example: //p' help >examples

# --- Dictionaries

quoted() { sort -u | sed 's/[\\"]/\\&/g; s/.*/"&"/'; }
switches() {
  sed -n 's/^  \(-[A-Za-z]*\).*/\1/p' help
  sed -n 's/^ *{"\([a-z0-9]*\)", tESSELNS.*/-\1/p' "$root/interfaces/constraints/ModeKeywords.h"
}
arguments() {
  sed -n 's/^ *{"\([A-Za-z]*\)", [A-Z][A-Za-z]*NS::.*/\1/p; s/.* {"\([A-Za-z]*\)", [A-Z][A-Za-z]*NS::.*/\1/p' \
    "$root/interfaces/devicemanager/AttributeNames.h"
  printf '%s\n' usb1 usb21 com1 lpt1 parport0 tty00 ttyS0 ttya auto null svf csvf stapl AUTO top.bit top.mcs top.exo \
    top.mpm top.bsd boot.elf map.bmm board.pdr lineWidth:80 default aux unknown 1 0 -1 +1 32768 65536 2147483647 \
    -2147483648 2147483648
}
calls() { sed -n 's/^ *{"\([A-Za-z0-9]*\)", [0-9], Answer::.*/!\1/p' "$root/tests/conformance/runner/Operations.cpp"; }
keywords() {
  printf '%s\n' MODE FILE_FORMAT SWAP_BIT FILL_VALUE DIRECTION PROM DESIGN DEVICE '#' zp18v01 4M 512
  sed -n 's/^ *{"\(pff[a-z]*\)", tESSELNS::PROM.*/\1/p' "$root/interfaces/constraints/ModeKeywords.h"
}
newline='"\x0a"'
{ cat words && switches && arguments; } | quoted >"$fuzz/TableFuzzer.dict"
{ cat words && switches && arguments && calls && printf '%s\n' throw log '@2' '#pdr ' ' -key S3cretKey42'; } |
  quoted >"$fuzz/SessionFuzzer.dict"
echo "$newline" >>"$fuzz/SessionFuzzer.dict"
{ printf '%s\n' -p -position -P -key '"' '#' // 1 +1 -1 2147483647 -2147483648 2147483648 -2147483647 | quoted &&
  printf '%s\n' "$newline" '"\x0d\x0a"' '"\x09"' '"\x00"'; } >"$fuzz/LinesFuzzer.dict"
{ keywords | quoted && printf '%s\n' "$newline" '"\x0d\x0a"'; } >"$fuzz/PdrFuzzer.dict"

# --- Seeds out of the cases

# Writes a file for every tenth case, which is enough to begin with: the answers in the form of Answers.h, then
# the lines of the command files.
awk '
  function at(place, choice) { choices = substr(choices, 1, place) choice substr(choices, place + 2) }
  function digit(number) { return number > 34 ? "z" : substr("0123456789abcdefghijklmnopqrstuvwxy", number + 1, 1) }
  function finish() {
    if (lines != "" && lines !~ /\/|\.\./ && ++cases % 10 == 0) {
      file = sprintf("Session/%s-%03d", previous, ++number)
      printf "%s%s\n%s%s", choices, words, description, lines >file
      close(file)
    }
    choices = ".........."
    words = description = lines = ""
    attribute = 0
  }
  FNR == 1 {
    finish()
    previous = FILENAME
    gsub(/.*\/|\.case$/, "", previous)
    number = 0
  }
  /^case / { finish() }
  /^ *batchlog on/ { words = words " log" }
  /^ *given getMode -> [0-9]/ { at(0, $NF) }
  /^ *given getActiveMode -> [0-9]/ { at(1, $NF) }
  /^ *given getSubmode -> [0-9]/ { at(2, $NF) }
  /^ *given getDeviceChainCount -> [0-9]/ { at(3, digit($NF)) }
  /^ *given getNumber[A-Za-z]* -> [1-9]/ { at(4, 7) }
  /^ *given getDeviceAttribute\(.*DeviceNS 1\)/ { at(5, 0) }
  /^ *given getDeviceAttribute\(.*DeviceNS 57\)/ { at(5, attribute += 1) }
  /^ *given getDeviceAttribute\(.*DeviceNS 58\)/ { at(5, attribute += 2) }
  /^ *given getDeviceAttribute\(.*DeviceNS 60\)/ { at(5, attribute += 4) }
  /^ *given getDeviceAttribute\(.*DeviceNS 61\)/ { at(5, attribute += 8) }
  /^ *given getCurrentCollectionName -> "c1"/ { at(6, 0) }
  /^ *given getTargetDevice.*\(0, [0-9]*, false\)/ { at(7, 1) }
  /^ *given getTargetDevice.*\(0, [0-9]*, true\)/ { at(7, 2) }
  /^ *given getTargetDevice.*\([1-8], [0-9]*, [a-z]*\)/ { at(7, 3) }
  /^ *given get(Program|Verify|Erase)Options/ { at(8, 0) }
  /^ *given isOptionSet.* true/ { at(8, 2) }
  /^ *during performOperation.* progress/ { at(9, 1) }
  /^ *during .* console-event/ { at(9, 3) }
  /^ *given .* -> (false|null)$/ { call = $2; sub(/\(.*\)/, "", call); words = words " !" call }
  /^ *given .* -> throw/ { words = words " throw" }
  /^ *file board.pdr "/ {
    text = $0
    sub(/^[^"]*"/, "", text)
    sub(/\\n"$|"$/, "", text)
    gsub(/\\n/, "\n#pdr ", text)
    description = "#pdr " text "\n"
  }
  /^ *> / { line = $0; sub(/^ *> /, "", line); lines = lines line "\n" }
  END { finish() }
' "$root"/tests/conformance/*.case

{ cat examples && sed -n 's/^ *> //p' "$root"/tests/conformance/*.case; } | sort -u >lines
awk '{ file = sprintf("Table/line-%04d", NR); printf "0%s", $0 >file; close(file) }' lines
awk 'NR % 8 == 1 { close(file); file = sprintf("Lines/lines-%04d", NR); printf "0" >file } { print >file }' lines
sed -n 's/^ *file board.pdr "\(.*\)"$/\1/p' "$root/tests/conformance/pdr.case" |
  awk '{
    file = sprintf("Pdr/case-%03d", NR)
    gsub(/\\n/, "\n")
    gsub(/\\t/, "\t")
    gsub(/\\r/, "\r")
    printf "%s", $0 >file
    close(file)
  }'

# --- Lines as long as the reader's buffer, nearly so, and across its blocks

long() { printf "%${1}s" '' | tr ' ' x; }
for length in 1021 1022 1023 2044; do
  { printf '0' && long "$length" && printf '\r\nprogram -p 1\n'; } >"Lines/long-$length"
  { printf '<' && long "$length" && printf '\nprogram -p 1\n'; } >"Lines/blocks-$length"
done

# --- What reaches something more

for name in Lines Table Pdr Session; do
  corpus=$fuzz/corpus/${name}Fuzzer
  mkdir -p "$corpus" "$scratch/chosen/$name"
  # Inputs that once broke something, and those made by hand, stay whatever they reach.
  find "$corpus" -type f ! -name 'found-*' ! -name 'kept-*' -delete
  "$bin/${name}Fuzzer" -set_cover_merge=1 -use_counters=0 "$scratch/chosen/$name" "$scratch/$name" "$corpus" \
    >/dev/null 2>merge.log || fail "$(tail -n 5 merge.log)"
  for seed in "$name"/*; do
    sum=$(sha1sum <"$seed")
    [[ ! -e chosen/$name/${sum%% *} ]] || cp "$seed" "$corpus"
  done
  say "${name}Fuzzer: $(find "$corpus" -type f | wc -l) seeds"
done

#!/usr/bin/env bash
# Intel HEX and S-record files, with srec_cat as the judge: it reads what tessel writes and tessel reads what it
# writes, to the same bytes. Needs package srecord; without it the test is skipped.
#   hex-files.sh PATH-OF-TESSEL-CONVERT
set -euo pipefail

convert=$1
command -v srec_cat >/dev/null || { echo "srec_cat is not installed"; exit 77; }

scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
cd "$scratch"

checks=0
failures=0

# same WHAT LEFT RIGHT: two files must have the same bytes.
same() {
  checks=$((checks + 1))
  cmp -s "$2" "$3" && return
  failures=$((failures + 1))
  printf 'differs: %s\n' "$1"
}

# alike WHAT FILE FORMAT FILE FORMAT: two files must give the same bytes at the same addresses.
alike() {
  checks=$((checks + 1))
  srec_cmp "${@:2}" && return
  failures=$((failures + 1))
  printf 'differs: %s\n' "$1"
}

# both NAME: NAME.bin goes through each format in both directions.
both() {
  local name=$1
  "$convert" "$name.bin" "$name.mcs"
  srec_cat "$name.mcs" -intel -o "$name.mcs.back" -binary
  same "srec_cat reads our Intel HEX of $name" "$name.bin" "$name.mcs.back"
  "$convert" "$name.bin" "$name.exo"
  srec_cat "$name.exo" -motorola -o "$name.exo.back" -binary
  same "srec_cat reads our S-record of $name" "$name.bin" "$name.exo.back"

  local width
  for width in 8 16 32 250; do
    srec_cat "$name.bin" -binary -o theirs.mcs -intel -line-length $((width * 2 + 11))
    "$convert" theirs.mcs back.bin
    same "we read Intel HEX of $name with $width bytes a line" "$name.bin" back.bin
  done
  local bytes
  for bytes in 2 3 4; do
    [[ $bytes -eq 2 && $(stat -c %s "$name.bin") -gt 65536 ]] && continue
    srec_cat "$name.bin" -binary -o theirs.exo -motorola -address-length=$bytes
    "$convert" theirs.exo back.bin
    same "we read S-record of $name with addresses of $bytes bytes" "$name.bin" back.bin
    srec_cat "$name.bin" -binary -o theirs.exo -motorola -address-length=$bytes -execution-start-address=0
    "$convert" theirs.exo back.bin
    same "we read S-record of $name with an end record" "$name.bin" back.bin
  done
}

head -c 1 /dev/urandom >one.bin
head -c 1000 /dev/urandom >short.bin
head -c 65536 /dev/zero >bank.bin
head -c 200001 /dev/urandom >long.bin
for name in one short bank long; do both "$name"; done

# Images with holes, far up in the address space.
srec_cat short.bin -binary -offset 0x12345678 one.bin -binary -offset 0xFFFFFFF0 -o holes.mcs -intel
"$convert" holes.mcs holes.exo
alike "holes survive S-record" holes.mcs -intel holes.exo -motorola
"$convert" holes.exo ours.mcs
alike "holes survive Intel HEX" holes.mcs -intel ours.mcs -intel

# Segments, as old tools write them.
srec_cat long.bin -binary -o segments.mcs -intel -address-length=3
grep -q '^:02000002' segments.mcs || { echo "srec_cat wrote no segments"; exit 1; }
"$convert" segments.mcs back.bin
same "we read segments" long.bin back.bin

printf '%d checks, %d failed\n' "$checks" "$failures"
[[ $checks -gt 0 && $failures -eq 0 ]]

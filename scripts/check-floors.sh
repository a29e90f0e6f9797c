#!/usr/bin/env bash
# Checks the structure of the source tree, or of the tree given behind the check's name:
#   includes  a folder includes only itself and the floors below it; batch/ and interfaces/ less still
#   sizes     no file of batch/ is longer than 400 lines
# Without a name both. Prints every offence and fails when there is one.
set -euo pipefail

check=${1:-all}
cd "${2:-"$(dirname "${BASH_SOURCE[0]}")/.."}"

longest=400
folders=(interfaces portability utility manager pdr constraints converters batch host)

source_files() { find "$@" -type f \( -name '*.h' -o -name '*.cpp' \) -print0 | sort -z; }

# Prints the offending includes. What stands in one row may not include one another.
find_wrong_includes() {
  source_files "${folders[@]}" | xargs -0 awk '
    BEGIN {
      floors = split("interfaces|portability|utility|manager pdr constraints converters|batch|host", rows, "|")
      for (i = 1; i <= floors; ++i) {
        count = split(rows[i], names, " ")
        for (j = 1; j <= count; ++j) floor[names[j]] = i
      }
      # The same within manager/, a folder a floor.
      within = split("support|scan|parts content|simulator chain devices|cables|operations|manager", rows, "|")
      for (i = 1; i <= within; ++i) {
        count = split(rows[i], names, " ")
        for (j = 1; j <= count; ++j) inner[names[j]] = i
      }
      # Devices are known through their interfaces only, so that they can be exchanged.
      onlyInterfaces["batch"]
    }
    function allowed(from, to) {
      if (from == to) return 1
      if (!(to in floor) || floor[to] >= floor[from]) return 0
      return !(from in onlyInterfaces) || to == "interfaces"
    }
    # The folder behind the first one of a path.
    function second(path) {
      sub(/^[^\/]*\//, "", path)
      return sub(/\/.*$/, "", path) ? path : ""
    }
    function allowedWithin(from, to) { return from == to || (to in inner && inner[to] < inner[from]) }
    function complain(why) { printf "%s:%d: %s\n", FILENAME, FNR, why }
    /^[ \t]*#[ \t]*include[ \t]*["<]/ {
      quoted = $0 ~ /include[ \t]*"/
      path = $0
      sub(/^[^"<]*["<]/, "", path)
      sub(/[">].*$/, "", path)
      folder = path
      if (!sub(/\/.*$/, "", folder)) folder = ""
      from = FILENAME
      sub(/\/.*$/, "", from)
      if (folder in floor) {
        if (!allowed(from, folder)) complain(from "/ may not include " path)
        if (from == "manager" && folder == from && !allowedWithin(second(FILENAME), second(path)))
          complain("manager/" second(FILENAME) "/ may not include " path)
      } else if (quoted) {
        complain("\"" path "\" is no path from the root of the tree")
      }
    }'
}

find_long_files() {
  source_files batch | xargs -0 awk -v longest="$longest" '
    FNR == longest + 1 { printf "%s: more than %d lines\n", FILENAME, longest }'
}

# report HEADLINE COMMAND
report() {
  local offences
  offences=$("$2") || offences+="the tree in $PWD cannot be read"
  if [[ -n $offences ]]; then
    printf '%s: no\n%s\n' "$1" "$offences" >&2
    return 1
  fi
  printf '%s: ok\n' "$1"
}

status=0
case $check in
  includes | sizes | all) ;;
  *)
    printf 'Unknown check %s, expected includes, sizes or nothing\n' "$check" >&2
    exit 2
    ;;
esac
[[ $check == sizes ]] || report 'Includes follow the floors' find_wrong_includes || status=1
[[ $check == includes ]] || report "Files of batch/ have $longest lines at most" find_long_files || status=1
exit "$status"

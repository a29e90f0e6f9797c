#!/usr/bin/env bash
# The structure check finds what it is for: each offence in a small tree of its own.
set -euo pipefail

check_floors=$1
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
failures=0

# A tree in which every folder keeps to its floor.
make_tree() {
  rm -rf "$scratch/tree"
  mkdir "$scratch/tree"
  cd "$scratch/tree"
  local folder
  for folder in interfaces portability utility manager pdr constraints converters batch host; do
    mkdir "$folder"
    printf '#include <vector>\n#include "interfaces/Export.h"\n' >"$folder/File.h"
  done
  printf '#include <CLI/CLI.hpp>\n#include "batch/CmdParser.h"\n#include "utility/File.h"\n' >host/main.cpp
  printf '#include "manager/File.h"\n#include "utility/File.h"\n#include "portability/File.h"\n' >manager/File.cpp
  mkdir manager/scan manager/devices
  printf '#include "manager/scan/File.h"\n#include "utility/File.h"\n' | tee manager/devices/File.h >manager/scan/File.h
  yes '// a line' | head -n 400 >batch/Long.cpp || true
}

# expect STATUS DESCRIPTION [TEXT]: checking the tree gives the status and says the text.
expect() {
  local status=0
  "$check_floors" all "$PWD" >"$scratch/report" 2>&1 || status=$?
  if [[ $status -eq $1 ]] && grep -qF -e "${3:-}" "$scratch/report"; then
    printf 'ok %s\n' "$2"
    return
  fi
  failures=$((failures + 1))
  printf 'not ok %s: status %s\n' "$2" "$status"
  cat "$scratch/report"
}

# refuse FILE LINE REASON: that line, added to a tree that is fine, is an offence.
refuse() {
  make_tree
  printf '%s\n' "$2" >>"$1"
  expect 1 "$2 in $1" "$1:$(grep -c '' "$1"): $3"
}

make_tree
expect 0 'a tree in order'

refuse portability/File.h '#include "utility/File.h"' 'portability/ may not include utility/File.h'
refuse utility/File.h '#include "batch/CmdParser.h"' 'utility/ may not include batch/CmdParser.h'
refuse manager/File.cpp '#include "pdr/File.h"' 'manager/ may not include pdr/File.h'
refuse manager/scan/File.h '#include "manager/devices/File.h"' 'manager/scan/ may not include manager/devices/File.h'
refuse manager/devices/File.h '#include "manager/File.h"' 'manager/devices/ may not include manager/File.h'
refuse interfaces/File.h '#include "portability/File.h"' 'interfaces/ may not include portability/File.h'
refuse batch/File.h '#include "manager/File.h"' 'batch/ may not include manager/File.h'
refuse batch/File.h '  #  include <utility/File.h>' 'batch/ may not include utility/File.h'
refuse converters/File.h '#include "../host/File.h"' '"../host/File.h" is no path from the root of the tree'
refuse host/main.cpp '#include "File.h"' '"File.h" is no path from the root of the tree'

make_tree
printf '// one more\n' >>batch/Long.cpp
expect 1 'a file of batch/ with 401 lines' 'batch/Long.cpp: more than 400 lines'

make_tree
rm -r pdr
expect 1 'a folder that is not there'

exit "$((failures > 0))"

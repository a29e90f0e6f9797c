#!/usr/bin/env bash
# Builds the fuzzers of tests/fuzz and runs each, or those that are named, for some seconds (30 unless said
# otherwise) from its seeds. Fails on a crash, a leak, a hang or a property that does not hold; the input is
# then in build/fuzz/artifacts. What a run finds on its way stays in build/fuzz/corpus for the next one.
#   scripts/fuzz.sh
#   scripts/fuzz.sh 600 SessionFuzzer
source "$(dirname "${BASH_SOURCE[0]}")/common.sh"

seconds=${1:-30}
[[ $seconds =~ ^[0-9]+$ ]] || fail "Expected a number of seconds, not $seconds"
[[ $# -eq 0 ]] || shift
names=("$@")
[[ ${#names[@]} -gt 0 ]] || names=(LinesFuzzer TableFuzzer PdrFuzzer SessionFuzzer
  BsdlFuzzer DataFileFuzzer BoardFuzzer StateFuzzer ServerFuzzer RemoteCableFuzzer)

# The first Clang of Debian 12 that knows all of the language that we use.
install_missing "${build_packages[@]}" clang-16 libclang-rt-16-dev
build_preset fuzz "${names[@]}"

built=$root/build/fuzz
mkdir -p "$built/artifacts"
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
export TMPDIR=$scratch
export UBSAN_OPTIONS=print_stacktrace=1
# Stacks are readable when a symbolizer is there; its path must be no link.
if symbolizer=$(command -v llvm-symbolizer-16 || command -v llvm-symbolizer); then
  ASAN_SYMBOLIZER_PATH=$(readlink -f "$symbolizer")
  export ASAN_SYMBOLIZER_PATH UBSAN_SYMBOLIZER_PATH=$ASAN_SYMBOLIZER_PATH
fi

# Runs one fuzzer and shows the end of what it says, or all that matters when it fails.
run_fuzzer() {
  local name=$1 log=$built/$1.log
  local found=$built/corpus/$name seeds=$root/tests/fuzz/corpus/$name dictionary=$root/tests/fuzz/$name.dict
  local options=()
  mkdir -p "$found"
  [[ ! -e $dictionary ]] || options+=(-dict="$dictionary")
  [[ -d $seeds ]] || seeds=()
  say "$name for $seconds s; its output is in $log"
  if "$built/bin/$name" -max_total_time="$seconds" -rss_limit_mb=2048 -timeout=10 -print_final_stats=1 \
    -artifact_prefix="$built/artifacts/$name-" "${options[@]}" "$found" "${seeds[@]}" >"$log" 2>&1; then
    grep -a -E 'DONE|stat::(number_of_executed_units|average_exec_per_sec)' "$log"
    return 0
  fi
  grep -a -A 40 -E 'does not hold|ERROR:|runtime error|SUMMARY|Test unit written' "$log" | tail -n 80
  return 1
}

# As many at a time as there are processors; what each says comes when it is done.
failed=()
for ((first = 0; first < ${#names[@]}; first += $(nproc))); do
  group=("${names[@]:first:$(nproc)}")
  processes=()
  for name in "${group[@]}"; do
    run_fuzzer "$name" >"$scratch/$name.said" 2>&1 &
    processes+=("$!")
  done
  for i in "${!group[@]}"; do
    wait "${processes[i]}" || failed+=("${group[i]}")
    cat "$scratch/${group[i]}.said"
  done
done
[[ ${#failed[@]} -eq 0 ]] || fail "${failed[*]}: see build/fuzz/artifacts"
say "No fuzzer found anything"

# shellcheck shell=bash
# What the scripts share: installing what is missing, and building a preset. Sourced, not run.

set -euo pipefail

root=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)

# What a build with tests needs. ccache is used when it is there.
build_packages=(g++ cmake ninja-build libcli11-dev nlohmann-json3-dev libgtest-dev libgmock-dev)
# Programs that judge ours in the tests with the label interop, which are skipped where they are missing.
interop_packages=(openocd srecord)

say() { printf '== %s\n' "$*"; }

fail() {
  printf 'ERROR: %s\n' "$*" >&2
  exit 1
}

as_root() {
  if [[ $(id -u) -eq 0 ]]; then "$@"; else sudo "$@"; fi
}

is_installed() {
  [[ $(dpkg-query --show --showformat='${db:Status-Status}' "$1" 2>/dev/null) == installed ]]
}

# Installs those of the named Debian packages that are missing. Elsewhere than on Debian it goes on with what
# is there, and CMake says what it misses.
install_missing() {
  local package missing=()
  if ! command -v apt-get >/dev/null; then
    say "No apt-get here: going on without a look at the packages $*"
    return
  fi
  for package in "$@"; do
    is_installed "$package" || missing+=("$package")
  done
  [[ ${#missing[@]} -gt 0 ]] || return 0
  [[ $(id -u) -eq 0 ]] || command -v sudo >/dev/null ||
    fail "There is no sudo. Run as root: apt-get install ${missing[*]}"
  say "Installing ${missing[*]}"
  local get=(env DEBIAN_FRONTEND=noninteractive apt-get -qq -o Acquire::Retries=3 -o DPkg::Lock::Timeout=120
    -o Dpkg::Use-Pty=0)
  as_root "${get[@]}" update
  as_root "${get[@]}" install --yes --no-install-recommends "${missing[@]}"
}

# Configures build/PRESET and builds it, or those of its targets that are named behind it.
build_preset() {
  local preset=$1 targets=()
  shift
  [[ $# -eq 0 ]] || targets=(--target "$@")
  say "Building preset $preset"
  cmake -S "$root" --preset "$preset"
  cmake --build "$root/build/$preset" "-j$(nproc)" "${targets[@]}"
}

# The tree's files that fit the patterns, each with a zero byte behind it. Files that are new count, too.
source_files() {
  # The tree may belong to another user, as it does under many CI systems.
  git -C "$root" -c safe.directory="$root" ls-files -z --cached --others --exclude-standard -- "$@"
}

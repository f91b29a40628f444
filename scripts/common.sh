# shellcheck shell=bash
# What the scripts share; sourced, never run. Sets `root`, the top of the checkout.

root=$(cd -- "$(dirname -- "${BASH_SOURCE[0]}")/.." && pwd)

say() { printf '%s\n' "$*"; }

warn() { printf '%s\n' "$*" >&2; }

die() {
  warn "$@"
  exit 1
}

# A cmake preset's build folder that was configured for another place cannot be used again.
configured_here() {
  local cache=$root/build/$1/CMakeCache.txt
  [[ -f $root/build/$1/build.ninja ]] && grep -qxF "CMAKE_HOME_DIRECTORY:INTERNAL=$root" "$cache"
}

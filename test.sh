#!/usr/bin/env bash
# Checks everything: format, build and tests of every preset, clang-tidy. See --help.
set -euo pipefail
# shellcheck source=scripts/packages.sh
source "$(dirname -- "${BASH_SOURCE[0]}")/scripts/packages.sh"
# shellcheck source=scripts/servers.sh
source "$root/scripts/servers.sh"
# shellcheck source=scripts/steps.sh
source "$root/scripts/steps.sh"

readonly all_steps=(format release asan tsan i386 tidy coverage bare)
# The others take long, and run by name.
readonly default_steps=(format release asan tsan i386)

usage() {
  cat <<TEXT
usage: ./test.sh [STEP...]

Installs what is missing and runs the steps; without names: ${default_steps[*]}.
  format    clang-format and shellcheck
  release   build and test what is shipped (64-bit)
  asan      build and test with the address and undefined-behaviour sanitizers
  tsan      build and test with the thread sanitizer
  i386      build and test for 32 bits
  tidy      clang-tidy over the project's own sources; half an hour at first, then what changed
  coverage  line and branch coverage, with a floor
  bare      run.sh and test.sh in a fresh Debian 12 root (as root)
Logs are in build/logs/.
TEXT
}

check_names() {
  local name
  for name in "$@"; do
    [[ " ${all_steps[*]} " == *" $name "* ]] || { usage >&2; die "Unknown step: $name"; }
  done
}

main() {
  case ${1-} in -h | --help) usage && exit ;; esac
  local steps=("$@") step
  ((${#steps[@]})) || steps=("${default_steps[@]}")
  check_names "${steps[@]}"
  local sections=(run remote test)
  for step in coverage bare; do
    [[ " ${steps[*]} " != *" $step "* ]] || sections+=("$step")
  done
  ensure_packages "${sections[@]}"
  ensure_servers
  cd "$root"
  mkdir -p build/logs
  for step in "${steps[@]}"; do
    run_step "$step"
  done
  print_summary
}

main "$@"

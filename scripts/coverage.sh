#!/usr/bin/env bash
# Builds with gcov, runs all tests and prints line and branch coverage: of the library, which has
# a floor, and of the stand-in host apart. Details per file are in build/coverage/.
set -euo pipefail
# shellcheck source=scripts/common.sh
source "$(dirname -- "${BASH_SOURCE[0]}")/common.sh"

readonly line_floor=90
readonly build=$root/build/coverage
# As patterns of paths from the top.
readonly library_rooms='(include|catalog|installers|provider|ipmi)/'

# Counts of an earlier run would be added to those of this one.
forget_counts() {
  find "$build" -name '*.gcda' -delete
}

# One pass over all counts; the summaries are made from what it writes.
collect() {
  gcovr --root "$root" --object-directory "$build" --json "$build/coverage.json" -j "$(nproc)" \
    --filter "$library_rooms|host/" \
    --exclude-unreachable-branches --exclude-throw-branches "$build"
}

# report TITLE FILTER [OPTION...]: per file to build/coverage/TITLE.txt, the totals to the terminal.
report() {
  local title=$1 filter=$2 verdict=0
  shift 2
  gcovr --root "$root" --add-tracefile "$build/coverage.json" --filter "$filter" \
    --txt "$build/$title.txt" --print-summary "$@" >"$build/$title.sum" || verdict=$?
  sed -n "s/^\(lines\|branches\): /$title \1: /p" "$build/$title.sum"
  return "$verdict"
}

main() {
  cd "$root"
  configured_here coverage || rm -rf "$build"
  cmake --preset coverage
  cmake --build --preset coverage
  forget_counts
  ctest --preset coverage
  collect
  report host host/
  report library "$library_rooms" --fail-under-line "$line_floor" ||
    die "The library's line coverage is below $line_floor %"
}

main

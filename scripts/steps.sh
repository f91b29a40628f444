# shellcheck shell=bash
# The steps of test.sh; sourced, and called in the top of the checkout. Each step_NAME prints to
# the step's log and returns its verdict.

# shellcheck source=scripts/common.sh
source "$(dirname -- "${BASH_SOURCE[0]}")/common.sh"

summary=()
failures=0

# run_step NAME: runs it into build/logs/NAME.log and shows how it ended.
run_step() {
  local name=$1 log=build/logs/$1.log start=$SECONDS verdict=ok
  say "== $name (log: $log)"
  # Not as a condition: bash would then ignore `set -e` inside.
  set +e
  (
    set -e
    "step_$name"
  ) >"$log" 2>&1 </dev/null
  local result=$?
  set -e
  if ((result)); then
    verdict=FAILED
    failures=$((failures + 1))
    without_progress "$log" | tail -n 150
  else
    closing_lines "$log"
  fi
  summary+=("$(printf '%-10s%-8s%5d s' "$name" "$verdict" $((SECONDS - start)))")
}

# What is left of a log without the lines of what went well.
without_progress() {
  grep -vE '^\[[0-9]+/[0-9]+\]|^ +Start +[0-9]+:|^ *[0-9]+/[0-9]+ Test .* Passed ' "$1"
}

# How a log that ended well ends: with ctest's verdict where ctest ran.
closing_lines() {
  if grep -q '% tests passed' "$1"; then
    sed -n '/% tests passed/,$p' "$1"
  else
    tail -n 1 "$1"
  fi
}

print_summary() {
  say "== summary"
  printf '%s\n' "${summary[@]}"
  if ((failures)); then
    die "$failures of ${#summary[@]} steps failed"
  fi
  say "All ${#summary[@]} steps passed in $SECONDS s"
}

# The project's own files of the given name patterns, each ended by a zero byte.
own_files() {
  local patterns=(-name "$1") pattern
  shift
  for pattern in "$@"; do
    patterns+=(-o -name "$pattern")
  done
  find . \( -path ./build -o -path ./.git -o -path ./.cache \) -prune -o \
    -type f \( "${patterns[@]}" \) -print0 | sort -z
}

step_format() {
  local verdict=0
  own_files '*.h' '*.c' '*.cpp' | xargs -0r clang-format-14 --dry-run -Werror || verdict=1
  { own_files '*.sh' && printf '.ci/run\0'; } | xargs -0r shellcheck --external-sources || verdict=1
  ((verdict == 0)) || return 1
  say "Sources and scripts are well formed"
}

# Address space randomisation of more than 28 bits is beyond what these sanitizer runtimes expect.
without_wide_randomisation() {
  local bits
  bits=$(cat /proc/sys/vm/mmap_rnd_bits 2>/dev/null || say 28)
  if ((bits > 28)); then
    setarch "$(uname -m)" -R "$@"
  else
    "$@"
  fi
}

configure() {
  configured_here "$1" || rm -rf "build/$1"
  cmake --preset "$1"
}

# build_and_test PRESET [PREFIX...]: programs run during the build as well, to list their tests.
# The build goes on past errors, so that one run shows them all.
build_and_test() {
  local preset=$1
  shift
  configure "$preset"
  "$@" cmake --build --preset "$preset" -- -k 0
  "$@" ctest --preset "$preset"
}

step_release() { build_and_test release; }
step_i386() { build_and_test i386; }
step_asan() { build_and_test asan without_wide_randomisation; }
step_tsan() { build_and_test tsan without_wide_randomisation; }
step_tidy() {
  configure release
  python3 scripts/tidy.py
}
step_coverage() { bash scripts/coverage.sh; }
step_bare() { bash tests/integration/bare/bare.sh; }

# shellcheck shell=bash
# Debian packages: which are missing, and installing them. Sourced, never run.

# shellcheck source=scripts/common.sh
source "$(dirname -- "${BASH_SOURCE[0]}")/common.sh"

# packages_of SECTION...: the names that scripts/packages.txt lists there.
packages_of() {
  local line section=''
  while read -r line; do
    case $line in
      '' | '#'*) ;;
      '['*']') section=${line:1:-1} ;;
      *) if [[ " $* " == *" $section "* ]]; then say "$line"; fi ;;
    esac
  done <"$root/scripts/packages.txt"
}

# missing_packages SECTION...: those of them that are not installed.
missing_packages() {
  local wanted installed
  wanted=$(packages_of "$@" | sort)
  # shellcheck disable=SC2086  # one word per package
  installed=$(dpkg-query -W -f '${Package} ${db:Status-Status}\n' $wanted 2>/dev/null |
    sed -n 's/ installed$//p' | sort -u) || true
  comm -23 <(say "$wanted") <(say "$installed")
}

# How this user becomes root: prints the words to put in front of a command, or fails.
root_prefix() {
  if ((EUID == 0)); then
    say env
  elif ! command -v sudo >/dev/null; then
    return 1
  elif sudo -n true 2>/dev/null || [[ -t 0 ]]; then
    say sudo
  else
    return 1
  fi
}

# ensure_packages SECTION...: installs what is missing; does nothing when all is there.
ensure_packages() {
  if ! command -v dpkg-query >/dev/null; then
    warn "This is no Debian system, so nothing is installed; the build needs what these packages bring:"
    warn "  $(packages_of "$@" | paste -sd ' ')"
    return
  fi
  local list missing prefix
  list=$(missing_packages "$@")
  [[ $list ]] || return 0
  mapfile -t missing <<<"$list"
  if ! prefix=$(root_prefix); then
    warn "Some packages are missing, and installing them takes root. Please run this, then try again:"
    warn "  apt-get update && apt-get install -y --no-install-recommends ${missing[*]}"
    exit 3
  fi
  install_packages "$prefix" "${missing[@]}"
}

# install_packages PREFIX PACKAGE...
install_packages() {
  local prefix=$1 log=$root/build/logs/packages.log
  shift
  mkdir -p "$root/build/logs"
  say "Installing: $*"
  if ! { "$prefix" apt-get update && "$prefix" DEBIAN_FRONTEND=noninteractive \
    apt-get install -y --no-install-recommends "$@"; } >"$log" 2>&1 </dev/null; then
    tail -n 20 "$log" >&2
    die "Installing packages failed; the whole log is $log"
  fi
}

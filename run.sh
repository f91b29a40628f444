#!/usr/bin/env bash
# Shows one installation request from end to end: builds the provider library and the stand-in
# host, makes the example packages, and installs them. See --help.
set -euo pipefail
# shellcheck source=scripts/packages.sh
source "$(dirname -- "${BASH_SOURCE[0]}")/scripts/packages.sh"
# shellcheck source=scripts/remote_demo.sh
source "$root/scripts/remote_demo.sh"

usage() {
  cat <<'TEXT'
usage: ./run.sh [tftp|sftp] [--packages LIST] [--] [ARGUMENT...]

Builds what is missing and runs `velkhost install` on the example packages, as
scenarios/default.toml describes the host.
  tftp, sftp        fetches them from a real server, which is started on the loopback
                    interface and ended again; package URIs cannot be given then
  --packages LIST   those of examples/LIST.list: default, firmware, adapters, hypervisor,
                    everything
Other arguments go to velkhost, such as --json, --clock real, --scenario FILE; package
URIs among them replace the examples.
The exit code is velkhost's, or 3 when packages must be installed by hand first. Without
arguments it is 0 when the examples end as they are meant to.
TEXT
}

build() {
  local log=$root/build/logs/run.log
  mkdir -p "$root/build/logs"
  say "Building (the first time takes a minute or two) ..."
  if ! { configured_here release || cmake --preset release --fresh -DBUILD_TESTING=OFF; } >"$log" 2>&1 ||
    ! cmake --build --preset release --target provider/all host/all >>"$log" 2>&1; then
    tail -n 40 "$log" >&2
    die "The build failed; the whole log is $log"
  fi
}

# In the checkout, unless its path is too long for the library's texts of 199 bytes.
packages_folder() {
  local folder=$root/build/packages
  ((${#folder} <= 120)) || folder=/tmp/velk-packages-$UID
  say "$folder"
}

# example_uris LIST BASE: its packages in the order of the request, as locations, one a line.
example_uris() {
  local name
  while read -r name; do
    [[ -z $name || $name == '#'* ]] || say "$2/$name"
  done <"$root/examples/$1.list"
}

# make_local_examples: prints where the packages are.
make_local_examples() {
  local folder
  folder=$(packages_folder)
  bash "$root/examples/make_packages.sh" "$folder" >&2
  say "$folder"
}

# install ARGUMENT...: runs the command in place of this shell.
install() {
  exec "$root/build/release/bin/velkhost" install "$@"
}

# One of the example packages fails on purpose, and velkhost says so with exit code 1.
show_examples() {
  local verdict=0
  (install "$@") || verdict=$?
  ((verdict != 130)) || exit 130  # Ctrl-C
  ((verdict == 1)) || die "velkhost ended with $verdict instead of 1, which the example that fails asks for"
  say "One example fails on purpose, so velkhost's own exit code is 1. All as it should be."
}

# locate_examples REMOTE: has them ready, from a server where REMOTE says so; sets `base` and
# `scenario`.
locate_examples() {
  local folder
  folder=$(make_local_examples)
  base=file://$folder
  [[ $1 ]] || return 0
  "serve_$1" "$root/scenarios/default.toml" "$folder"
  scenario=(--scenario "$remote_scenario")
  base=$remote_base
}

main() {
  local list=default remote=''
  case ${1-} in tftp | sftp) remote=$1 && shift ;; esac
  if [[ ${1-} == --packages ]]; then
    list=${2-}
    [[ -f $root/examples/$list.list ]] || die "--packages needs the name of a list in examples/: default, firmware, ..."
    shift 2
  fi
  [[ ${1-} != -- ]] || shift
  local argument scenario=(--scenario "$root/scenarios/default.toml") own_uris='' uris=() base='' examples
  for argument in "$@"; do
    case $argument in
      -h | --help) usage && exit ;;
      --scenario*) scenario=() ;;
      *://* | *.xml) own_uris=yes ;;
    esac
  done
  if [[ $remote && ($own_uris || ${#scenario[@]} == 0) ]]; then
    die "$remote brings its own packages and scenario"
  fi
  ensure_packages run ${remote:+remote}
  [[ ! $remote ]] || ensure_servers
  (cd "$root" && build)
  if [[ ! $own_uris ]]; then
    locate_examples "$remote"
    examples=$(example_uris "$list" "$base")
    mapfile -t uris <<<"$examples"
  fi
  if (($# == 0)) && [[ $list == default ]]; then
    show_examples "${scenario[@]}" "${uris[@]}"
  elif [[ $remote ]]; then
    (install "${scenario[@]}" "$@" "${uris[@]}") # the server is to be ended afterwards
  else
    install "${scenario[@]}" "$@" "${uris[@]}"
  fi
}

main "$@"

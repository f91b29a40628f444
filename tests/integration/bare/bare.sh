#!/usr/bin/env bash
# Does what a newcomer does on a bare Debian 12: a fresh root without compiler or CMake, a clone of
# this repository, ./run.sh, ./test.sh. Only committed files take part. Runs as root; needs git,
# mmdebstrap and this machine's package sources, nothing else from outside.
set -euo pipefail
# shellcheck source=scripts/common.sh
source "$(dirname -- "${BASH_SOURCE[0]}")/../../../scripts/common.sh"

readonly suite=bookworm
readonly checkout="/srv/a checkout/velkprovider"  # a path with a blank must do
keep=''
steps=()
bare=''

usage() {
  say "usage: tests/integration/bare/bare.sh [--keep] [STEP...]"
  say "Without steps, test.sh runs its default ones; --keep leaves the root folder for a look inside."
}

parse_arguments() {
  local argument
  for argument in "$@"; do
    case $argument in
      --keep) keep=yes ;;
      -h | --help) usage && exit ;;
      *) steps+=("$argument") ;;
    esac
  done
}

unmount_all() {
  local point
  while read -r point; do
    umount -- "$point" || umount --lazy -- "$point"
  done < <(findmnt --raw --noheadings --output TARGET | grep -F "$bare/" | sort -r)
}

clean_up() {
  [[ $bare ]] || return 0
  unmount_all
  if [[ $keep ]]; then
    say "The root is kept in $bare"
  else
    rm -rf --one-file-system -- "$bare"
  fi
}

# This machine's own package sources and the keys and proxy that go with them.
make_root() {
  local sources=() options=(--variant=minbase --quiet) file proxy
  for file in /etc/apt/sources.list /etc/apt/sources.list.d/*.list /etc/apt/sources.list.d/*.sources; do
    [[ -s $file ]] && sources+=("$file")
  done
  proxy=$(apt-config shell proxy Acquire::http::Proxy | sed "s/^proxy='\(.*\)'$/\1/")
  [[ -z $proxy ]] || options+=(--aptopt="Acquire::http::Proxy \"$proxy\"")
  ! grep -q 'https:' "${sources[@]}" || options+=(--include=ca-certificates)
  mmdebstrap "${options[@]}" "$suite" "$bare" "${sources[@]}"
}

# Own instances throughout: nothing of this machine's /dev is reachable from inside.
mount_kernel_folders() {
  mount -t proc proc "$bare/proc"
  mount -t sysfs -o ro sysfs "$bare/sys"
  mkdir -p "$bare/dev/pts" "$bare/dev/shm"
  mount -t devpts -o newinstance,ptmxmode=0666 devpts "$bare/dev/pts"
  mount -t tmpfs -o nosuid,nodev,mode=1777 tmpfs "$bare/dev/shm"
}

# inside COMMAND...: in the bare root, with nothing of this shell's environment.
inside() {
  chroot "$bare" /usr/bin/env -i HOME=/root LANG=C.UTF-8 CI="${CI-}" \
    PATH=/usr/local/sbin:/usr/local/bin:/usr/sbin:/usr/bin:/sbin:/bin "$@" </dev/null
}

# timed TITLE COMMAND...
timed() {
  local title=$1 start=$SECONDS verdict=0
  shift
  "$@" || verdict=$?
  say "-- $title: exit code $verdict, $((SECONDS - start)) s"
  return "$verdict"
}

expect_bare() {
  local tool
  for tool in g++ cmake ninja clang-tidy-14; do
    ! inside sh -c "command -v $tool" >/dev/null || die "The bare root already has $tool"
  done
}

main() {
  parse_arguments "$@"
  ((EUID == 0)) || die "Making a root and changing into it takes root rights"
  bare=$(mktemp -d /tmp/velk-bare.XXXXXX)
  chmod 755 "$bare"
  trap clean_up EXIT
  trap 'exit 130' INT TERM
  timed "making the bare root" make_root
  git clone --quiet --no-local "$root" "$bare$checkout"
  mount_kernel_folders
  expect_bare
  timed "run.sh, first time" inside "$checkout/run.sh"
  timed "run.sh, second time" inside "$checkout/run.sh"
  timed "test.sh" inside "$checkout/test.sh" "${steps[@]}"
}

main "$@"

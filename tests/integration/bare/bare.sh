#!/usr/bin/env bash
# Does what a newcomer does on a bare Debian 12: a fresh root without compiler or CMake, a clone of
# this repository, ./run.sh, ./test.sh; and in another such root, an installation of the packages
# that the tests made. Only committed files take part. Runs as root; needs git, mmdebstrap and this
# machine's package sources, nothing else from outside.
set -euo pipefail
# shellcheck source=scripts/common.sh
source "$(dirname -- "${BASH_SOURCE[0]}")/../../../scripts/common.sh"

readonly suite=bookworm
readonly checkout="/srv/a checkout/velkprovider"  # a path with a blank must do
keep=''
steps=()
bare=''      # the root in use
roots=()     # all that were made

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
  done < <(findmnt --raw --noheadings --output TARGET | grep -F "$1/" | sort -r)
}

clean_up() {
  local root_folder
  for root_folder in "${roots[@]}"; do
    unmount_all "$root_folder"
    if [[ $keep ]]; then
      say "A root is kept in $root_folder"
    else
      rm -rf --one-file-system -- "$root_folder"
    fi
  done
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
  bare=$(mktemp -d /tmp/velk-bare.XXXXXX)
  roots+=("$bare")
  chmod 755 "$bare"
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

# Installs the packages of the first root into one of their own, uses them and removes them.
try_packages() {
  local packages=("$bare$checkout/build/release/packages-deb/"*.deb) examples=/usr/share/velkhost/examples
  [[ -f ${packages[0]} ]] || die "No packages were made"
  timed "making another bare root" make_root
  cp -- "${packages[@]}" "$bare/srv"
  mount_kernel_folders
  expect_bare
  inside apt-get -qq update
  timed "installing the packages" inside sh -c 'apt-get -qq install -y --no-install-recommends /srv/*.deb >/dev/null'
  inside "$examples/make_packages.sh" /srv/packages
  inside sh -c 'cd /srv/packages && velkhost install --scenario /usr/share/velkhost/scenarios/default.toml \
    zeb_fw_rxc_r1ao58-3.10_anyos.xml lsi_fw_sas_9240-20.12.0-0004_anyos.xml'
  timed "removing them" inside apt-get -qq purge -y velkhost velkprovider
  [[ ! -e $bare/usr/lib/velkhost && ! -e $bare/usr/lib/cim ]] || die "The packages left something behind"
}

main() {
  parse_arguments "$@"
  ((EUID == 0)) || die "Making a root and changing into it takes root rights"
  trap clean_up EXIT
  trap 'exit 130' INT TERM
  timed "making the bare root" make_root
  git clone --quiet --no-local "$root" "$bare$checkout"
  mount_kernel_folders
  expect_bare
  timed "run.sh, first time" inside "$checkout/run.sh"
  timed "run.sh, second time" inside "$checkout/run.sh"
  timed "test.sh" inside "$checkout/test.sh" "${steps[@]}"
  # The release step makes them; without steps it is among those that run.
  if [[ -z ${steps[*]} || " ${steps[*]} " == *" release "* ]]; then
    try_packages
  fi
}

main "$@"

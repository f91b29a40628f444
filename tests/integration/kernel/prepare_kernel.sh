#!/usr/bin/env bash
# prepare_kernel.sh FOLDER: puts Debian's kernel, unpacked, and its IPMI modules into FOLDER:
# vmlinux and modules/*.ko. What is there already is kept. Exits with 77 where the package cannot be
# had, and says why.
#
# Only the kernel image and three modules are taken out of the package: it is never installed.
set -euo pipefail

readonly skip=77
readonly folder=${1:?usage: prepare_kernel.sh FOLDER}
readonly modules=(ipmi_msghandler ipmi_devintf ipmi_si)

say() { printf '%s\n' "$*"; }

give_up() {
  say "SKIPPED: $*"
  exit "$skip"
}

is_complete() {
  local name
  [[ -s $folder/vmlinux ]] || return 1
  for name in "${modules[@]}"; do
    [[ -s $folder/modules/$name.ko ]] || return 1
  done
}

# The metapackage names the package that has the files.
versioned_package() {
  apt-cache depends linux-image-amd64 2>/dev/null |
    sed -n 's/^ *Depends: \(linux-image-[0-9].*-amd64\)$/\1/p' | head -n 1
}

fetch_package() {
  local package
  command -v xz >/dev/null || give_up "there is no xz"
  package=$(versioned_package) || true
  [[ $package ]] || give_up "apt knows no linux-image-amd64"
  (cd "$1" && apt-get download "$package") >"$1/download.log" 2>&1 ||
    give_up "cannot download $package: $(tail -n 1 "$1/download.log")"
}

unpack_files() {
  local package
  package=$(echo "$1"/linux-image-*.deb)
  dpkg-deb --fsys-tarfile "$package" |
    tar -x -C "$1" --wildcards './boot/vmlinuz-*' './lib/modules/*/kernel/drivers/char/ipmi/*'
}

# Four bytes of a file, least significant first.
number_at() {
  od -An -v -tu4 -j "$2" -N 4 "$1" | tr -d ' '
}

# The kernel proper lies compressed in the image, behind the set-up code. Where it begins and how
# long it is stands in the header (Linux, Documentation/x86/boot.rst): setup_sects at 0x1F1,
# payload_offset at 0x248, payload_length at 0x24C. Its last four bytes are not of the xz stream.
unpack_kernel() {
  local image=$1 sectors offset length
  sectors=$(od -An -v -tu1 -j $((0x1F1)) -N 1 "$image" | tr -d ' ')
  offset=$(((sectors + 1) * 512 + $(number_at "$image" $((0x248)))))
  length=$(($(number_at "$image" $((0x24C))) - 4))
  head -c $((offset + length)) "$image" | tail -c "$length" | xz -dc
}

main() {
  is_complete && return
  mkdir -p "$folder"
  local work
  work=$(mktemp -d "$folder/work.XXXXXX")
  # shellcheck disable=SC2064  # the folder's name of now
  trap "rm -rf '$work'" EXIT
  fetch_package "$work"
  unpack_files "$work"
  mkdir -p "$folder/modules"
  local name
  for name in "${modules[@]}"; do
    cp "$work"/lib/modules/*/kernel/drivers/char/ipmi/"$name.ko" "$folder/modules/"
  done
  unpack_kernel "$work"/boot/vmlinuz-* >"$work/vmlinux"
  mv "$work/vmlinux" "$folder/vmlinux"
}

main
is_complete || { say "The package lacks something"; exit 1; }
say "The kernel is in $folder"

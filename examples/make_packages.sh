#!/usr/bin/env bash
# Makes the example packages in a folder: copies each descriptor of examples/packages and makes the
# payload that it names, with the size that it states. What comes out is the same on every machine
# and at every run; a payload that is already as it should be is left alone.
#
#   examples/make_packages.sh FOLDER
#
# Needs bash and the core utilities. Ends with 0, or with 1 and a message.
set -euo pipefail

source_folder=$(cd -- "$(dirname -- "${BASH_SOURCE[0]}")" && pwd)/packages

fail() {
  printf 'make_packages.sh: %s\n' "$1" >&2
  exit 1
}

# property FILE NAME: the value of a simple property, as the line after its header has it.
property() {
  local line header="<PROPERTY NAME=\"$2\" TYPE="
  while IFS= read -r line; do
    if [[ $line == *"$header"* ]]; then
      IFS= read -r line
      line=${line#*<VALUE>}
      printf '%s' "${line%</VALUE>*}"
      return
    fi
  done < "$1"
  fail "$1 has no property $2"
}

# noise SEED COUNT: COUNT bytes (a multiple of 8) from a xorshift generator, in hexadecimal.
noise() {
  local -i state=$1 i
  local -a words=()
  for ((i = 0; i < $2 / 8; i++)); do
    ((state ^= state << 13, state ^= (state >> 7) & 0x01FFFFFFFFFFFFFF, state ^= state << 17))
    words+=("$state")
  done
  printf '%016X' "${words[@]}"
}

# image CODE VERSION SIZE: a firmware image: a header of 128 bytes, then the content. The content
# depends on the code and the version alone.
image() {
  local sum
  sum=$(printf '%s %s' "$1" "$2" | sha256sum)
  printf 'ZEBFWIMG%-64.64s%-32.32s%08X%016d' "$1" "$2" "$3" 128
  noise "0x0${sum:0:15}1" $(($3 - 128)) | basenc --base16 -d
}

checksum() {
  local sum
  sum=$(sha256sum -- "$1")
  printf '%s' "${sum%% *}"
}

# payload FILE CODE VERSION SIZE [CHECKSUM]
payload() {
  local file=$1 wanted=${5:-}
  if [[ -n $wanted && -f $file && $(checksum "$file") == "$wanted" ]]; then
    return
  fi
  image "$2" "$3" "$4" > "$file.new"
  if [[ -n $wanted && $(checksum "$file.new") != "$wanted" ]]; then
    rm -f -- "$file.new"
    fail "${file##*/} came out with another checksum than its descriptor states"
  fi
  mv -f -- "$file.new" "$file"
}

package() {
  local descriptor=$1 folder=$2
  payload "$folder/$(property "$descriptor" payload)" \
    "$(property "$descriptor" identificationCode)" "$(property "$descriptor" version)" \
    "$(property "$descriptor" payloadSize)" "$(property "$descriptor" payloadChecksum)"
  cp -f -- "$descriptor" "$folder/"
}

main() {
  [[ $# -eq 1 ]] || fail 'usage: make_packages.sh FOLDER'
  mkdir -p -- "$1"
  local descriptor
  for descriptor in "$source_folder"/*.xml; do
    package "$descriptor" "$1"
  done
  # A package on purpose without a descriptor: its payload is there, its .xml is not.
  payload "$1/zeb_fw_rxc_r1ao60-3.20_anyos.upd" ZEB_rxc_r1ao60 3.20 16384
}

main "$@"

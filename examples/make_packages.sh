#!/usr/bin/env bash
# Makes the example packages in a folder: copies each descriptor of examples/packages and makes the
# payload that it names. What comes out is the same on every machine and at every run; a payload
# that is already as it should be is left alone.
#
#   examples/make_packages.sh FOLDER [PACKAGE...]     PACKAGE: a name without .xml; none: all
#
# Needs bash, gzip and the core utilities. Ends with 0, or with 1 and a message.
set -euo pipefail

examples=$(cd -- "$(dirname -- "${BASH_SOURCE[0]}")" && pwd)
source_folder=$examples/packages
# shellcheck source=examples/zip_writer.sh
source "$examples/zip_writer.sh"
# shellcheck source=examples/depot_writer.sh
source "$examples/depot_writer.sh"

readonly adapter_image_size=16384

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

# adapter_archive CONFIGURATION VERSION: a zip archive of the payload configuration file and the
# images that it names. Its text is deflated; images, which nothing makes smaller, are stored.
adapter_archive() {
  local name file=$scratch/image.new
  zip_begin
  zip_file image/payload.xml "$1" 8
  while IFS= read -r name; do
    image "${name##*/}" "$2" "$adapter_image_size" > "$file"
    zip_file "$name" "$file" 0
  done < <(sed -n 's/.*<payload[^>]*>\([^<]*\)<.*/\1/p' "$1")
  zip_end
}

checksum() {
  local sum
  sum=$(sha256sum -- "$1")
  printf '%s' "${sum%% *}"
}

# payload FILE CHECKSUM COMMAND...: makes the file from what the command writes, unless it is there
# with that checksum; an empty one fits every file.
payload() {
  local file=$1 wanted=$2
  shift 2
  if [[ -n $wanted && -f $file && $(checksum "$file") == "$wanted" ]]; then
    return
  fi
  "$@" > "$file.new"
  if [[ -n $wanted && $(checksum "$file.new") != "$wanted" ]]; then
    rm -f -- "$file.new"
    fail "${file##*/} came out with another checksum than its descriptor states"
  fi
  mv -f -- "$file.new" "$file"
}

# depot SOURCE FOLDER CHECKSUM: a bundle of the hypervisor's updates, with that checksum of its
# metadata.
depot() {
  local source=$1 folder=$2 vib file
  mkdir -p -- "$folder"
  cp -f -- "$source/index.xml" "$source/vendor-index.xml" "$folder/"
  payload "$folder/metadata.zip" "$3" depot_metadata "$source"
  for vib in "$source"/vibs/*.xml; do
    file=$folder/$(depot_text "$vib" relative-path)
    mkdir -p -- "${file%/*}"
    payload "$file" '' depot_vib "$vib"
  done
}

# package NAME FOLDER
package() {
  local descriptor=$source_folder/$1.xml folder=$2 file version sum
  [[ -f $descriptor ]] || fail "there is no package $1"
  file=$(property "$descriptor" payload)
  version=$(property "$descriptor" version)
  sum=$(property "$descriptor" payloadChecksum)
  if [[ $file == */ ]]; then
    depot "$source_folder/$1" "$folder/${file%/}" "$sum"
  elif [[ $file == *.zip ]]; then
    payload "$folder/$file" "$sum" adapter_archive "$source_folder/$1/payload.xml" "$version"
  else
    payload "$folder/$file" "$sum" image "$(property "$descriptor" identificationCode)" \
      "$version" "$(property "$descriptor" payloadSize)"
  fi
  cp -f -- "$descriptor" "$folder/"
}

all_packages() {
  local folder=$1 descriptor
  for descriptor in "$source_folder"/*.xml; do
    package "$(basename "$descriptor" .xml)" "$folder"
  done
  # A package on purpose without a descriptor: its payload is there, its .xml is not.
  payload "$folder/zeb_fw_rxc_r1ao60-3.20_anyos.upd" '' image ZEB_rxc_r1ao60 3.20 16384
}

main() {
  (($# > 0)) || fail 'usage: make_packages.sh FOLDER [PACKAGE...]'
  local folder=$1 name
  shift
  mkdir -p -- "$folder"
  scratch=$(mktemp -d)
  trap 'rm -rf -- "$scratch"' EXIT
  if (($# == 0)); then
    all_packages "$folder"
  fi
  for name in "$@"; do
    package "$name" "$folder"
  done
}

main "$@"

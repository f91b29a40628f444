# shellcheck shell=bash
# Writes a bundle of the hypervisor's updates as it lies unpacked in a folder: the two indexes, the
# archive of the metadata, and the packages (VIBs) that the metadata list. Sourced, never run; needs
# zip_writer.sh, and noise COUNT bytes as make_packages.sh makes them.
#
#   depot_metadata SOURCE           writes metadata.zip to standard output
#   depot_vib DESCRIPTOR            writes the package to standard output
#   depot_text FILE ELEMENT         the text of the one <ELEMENT> in the file

depot_text() {
  sed -n "s:.*<$2>\(.*\)</$2>.*:\1:p" "$1"
}

depot_metadata() {
  local file
  zip_begin
  zip_file bulletin.xml "$1/bulletin.xml" 8
  for file in "$1"/vibs/*.xml; do
    zip_file "vibs/${file##*/}" "$file" 8
  done
  zip_end
}

# ar_header NAME SIZE: of a member of an ar archive, always of the same date.
ar_header() {
  printf '%-16s%-12d%-6d%-6d%-8s%-10d`\n' "$1" 1366848000 0 0 100644 "$2"
}

# The descriptor and the package's contents, which fill it up to the size that is stated.
depot_vib() {
  local -i size text_size rest
  local sum
  size=$(depot_text "$1" packed-size)
  text_size=$(stat -c %s -- "$1")
  rest=$((size - 8 - 60 - text_size - text_size % 2 - 60))
  sum=$(sha256sum < "$1")
  printf '!<arch>\n'
  ar_header descriptor.xml "$text_size"
  cat -- "$1"
  if ((text_size % 2 == 1)); then
    printf '\n'
  fi
  ar_header "$(depot_text "$1" name)" "$rest"
  noise "0x0${sum:0:15}1" $(((rest + 7) / 8 * 8)) | basenc --base16 -d | head -c "$rest"
}

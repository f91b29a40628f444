# shellcheck shell=bash
# Writes a zip archive whose bytes depend on its files alone: names, contents, and a date that is
# always the same. Sourced, never run; needs gzip, which brings the deflated data and the checksum.
#
#   zip_begin
#   zip_file NAME FILE METHOD       (0: stored, 8: deflated), any number of times
#   zip_end                         each writes to standard output; not in a subshell

zip_date=$(((2013 - 1980) << 9 | 4 << 5 | 12)) # as MS-DOS has it

# zip_number VALUE WIDTH: in little-endian order, as escapes for printf.
zip_number() {
  local -i i
  for ((i = 0; i < $2; i++)); do
    printf '\\x%02X' $((($1 >> 8 * i) & 0xFF))
  done
}

zip_begin() {
  zip_offset=0
  zip_count=0
  zip_directory='' # as escapes
  zip_directory_size=0
}

# zip_data FILE METHOD: the file as it stands in the archive. What gzip adds around the deflated
# data are 10 bytes in front and 8 behind.
zip_data() {
  if (($2 == 8)); then
    gzip -9nc -- "$1" | tail -c +11 | head -c -8
  else
    cat -- "$1"
  fi
}

zip_checksum() {
  gzip -1nc -- "$1" | tail -c 8 | od -An -N4 -tu4 --endian=little
}

zip_file() {
  local name=$1 file=$2 method=$3 fields
  local -i packed size checksum local_size
  packed=$(zip_data "$file" "$method" | wc -c)
  size=$(stat -c %s -- "$file")
  checksum=$(zip_checksum "$file")
  fields=$(
    zip_number 20 2 && zip_number 0 2 && zip_number "$method" 2 && zip_number 0 2
    zip_number "$zip_date" 2 && zip_number "$checksum" 4 && zip_number "$packed" 4
    zip_number "$size" 4 && zip_number ${#name} 2 && zip_number 0 2
  )
  printf '%b' "PK\x03\x04$fields$name"
  zip_data "$file" "$method"
  local_size=$((30 + ${#name} + packed))
  # Made on Unix, a plain file of mode 0644.
  zip_directory+="PK\x01\x02$(zip_number 0x0314 2)$fields$(zip_number 0 6)"
  zip_directory+="$(zip_number 0x81A40000 4)$(zip_number "$zip_offset" 4)$name"
  zip_directory_size=$((zip_directory_size + 46 + ${#name}))
  zip_offset=$((zip_offset + local_size))
  zip_count=$((zip_count + 1))
}

zip_end() {
  local count
  count=$(zip_number "$zip_count" 2)
  printf '%b' "${zip_directory}PK\x05\x06$(zip_number 0 4)$count$count"
  printf '%b' "$(zip_number "$zip_directory_size" 4)$(zip_number "$zip_offset" 4)$(zip_number 0 2)"
}

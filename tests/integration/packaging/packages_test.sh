#!/usr/bin/env bash
# Tries the Debian packages: packages_test.sh CASE FOLDER_OF_PACKAGES SOURCES
# Ends with 0, with 77 where a case cannot be tried here, or with 1 and what is wrong.
set -euo pipefail

readonly folder=$2 sources=$3
place=$(mktemp -d "${TMPDIR:-/tmp}/velk-packages.XXXXXX")
trap 'rm -rf -- "$place"' EXIT

fail() {
  printf 'FAILED: %s\n' "$@" >&2
  exit 1
}

skip() {
  printf 'skipped: %s\n' "$@"
  exit 77
}

# expect TITLE GOT WANTED
expect() {
  [[ $2 == "$3" ]] || fail "$1" "got:" "$2" "wanted:" "$3"
}

package() {
  local found=("$folder/$1"_*.deb)
  printf '%s\n' "${found[0]}"
}

# The files of a package, without folders.
files_of() {
  dpkg-deb -c "$(package "$1")" | grep -v '^d' | sed 's/.* \.\(\/[^ ]*\).*/\1/' | LC_ALL=C sort
}

# ---- What is in them ----

case_contents() {
  expect "files of velkprovider" "$(files_of velkprovider)" "$(
    cat <<'LIST'
/usr/lib/cim/libvelkprovider.so
/usr/share/doc/velkprovider/changelog.gz
/usr/share/doc/velkprovider/copyright
/usr/share/doc/velkprovider/operator.md
/usr/share/doc/velkprovider/packager.md
/usr/share/velkprovider/base/cim_base.mof
/usr/share/velkprovider/base/cim_qualifiers.mof
/usr/share/velkprovider/velk_cimv2.mof
/usr/share/velkprovider/velkprovider.reg
LIST
  )"
  local file files
  files=$(files_of velkhost)
  for file in /usr/bin/velkhost /usr/lib/velkhost/parts/libvelk{shim,broker,provider}.so \
    /usr/lib/velkhost/parts/lib{concretejob,unzipfile,zebfiletransfer}.so \
    /usr/share/velkhost/{mof/zeb_cimv2.mof,registration/standin.reg,scenarios/default.toml} \
    /usr/share/velkhost/examples/make_packages.sh /usr/share/man/man1/velkhost.1.gz; do
    grep -qxF "$file" <<<"$files" || fail "velkhost lacks $file"
  done
  expect "what velkprovider needs" "$(dpkg-deb -f "$(package velkprovider)" Depends | sed 's/ (.*//')" libc6
  dpkg-deb -x "$(package velkprovider)" "$place"
  ! grep -q '#pragma include' "$place/usr/share/velkprovider/velk_cimv2.mof" ||
    fail "the staged class includes what a broker has already"
  cmp "$place/usr/share/velkprovider/velkprovider.reg" "$sources/mof/registration/velkprovider.reg"
}

case_library() {
  dpkg-deb -x "$(package velkprovider)" "$place"
  local library=$place/usr/lib/cim/libvelkprovider.so dynamic
  dynamic=$(readelf -Wd "$library")
  expect "libraries it needs" "$(sed -n 's/.*(NEEDED).*\[\(.*\)\]/\1/p' <<<"$dynamic")" libc.so.6
  ! grep -qE 'RPATH|RUNPATH' <<<"$dynamic" || fail "it has a run path"
  ! grep -q TEXTREL <<<"$dynamic" || fail "it has text relocations"
  grep -q BIND_NOW <<<"$dynamic" || fail "it is not bound at load"
  readelf -Wl "$library" | grep -q GNU_RELRO || fail "it has no read-only relocations"
  ! readelf -WS "$library" | grep -q ' \.symtab ' || fail "it is not stripped"
}

case_lintian() {
  command -v lintian >/dev/null || skip "lintian is not installed"
  local options=('--fail-on=error,warning') findings
  ((EUID)) || options+=(--allow-root)
  findings=$(lintian "${options[@]}" "$(package velkprovider)" "$(package velkhost)" 2>&1) ||
    fail "lintian finds:" "$findings"
}

# ---- Installing them ----

# In a root folder of their own; maintainer scripts run outside of it, with nothing of this machine
# to stage to.
in_root() {
  local become=()
  ((EUID == 0)) || become=(unshare --map-root-user)
  "${become[@]}" env PATH="$place/tools:$PATH" dpkg --root="$place/root" --log="$place/dpkg.log" \
    --force-script-chrootless --force-depends --force-bad-path "$@" >"$place/out" 2>&1 ||
    fail "dpkg $*" "$(cat "$place/out")"
}

make_root() {
  ((EUID == 0)) || unshare --map-root-user true 2>/dev/null || skip "needs root or user namespaces"
  mkdir -p "$place"/root/var/lib/dpkg/{info,updates} "$place/tools"
  : >"$place/root/var/lib/dpkg/status"
}

left_in_root() {
  find "$place/root" -path "$place/root/var/lib/dpkg" -prune -o ! -type d -print
}

case_installation() {
  make_root
  in_root -i "$(package velkprovider)" "$(package velkhost)"
  local usr=$place/root/usr
  bash "$usr/share/velkhost/examples/make_packages.sh" "$place/p" >/dev/null
  "$usr/bin/velkhost" install --discard --scenario "$usr/share/velkhost/scenarios/default.toml" \
    "$place/p/zeb_fw_rxc_r1ao58-3.10_anyos.xml" "$place/p/lsi_fw_sas_9240-20.12.0-0004_anyos.xml" \
    >"$place/out" || fail "the installed velkhost ends with $?" "$(cat "$place/out")"
  grep -q '^2 of 2 packages installed$' "$place/out" || fail "no result" "$(cat "$place/out")"
  in_root -r velkhost velkprovider
  expect "what is left" "$(left_in_root)" ""
}

# tool NAME [EXIT_CODE]: a stand-in for one of a broker's commands, which writes down its calls.
tool() {
  printf '#!/bin/sh\necho "%s $*" >>%q\nexit %d\n' "$1" "$place/calls" "${2-0}" >"$place/tools/$1"
  chmod +x "$place/tools/$1"
}

case_staging() {
  make_root
  tool sfcbstage && tool sfcbunstage && tool sfcbrepos
  in_root -i "$(package velkprovider)"
  in_root -r velkprovider
  expect "calls of a broker's tools" "$(cat "$place/calls")" \
    "sfcbstage -n velk/cimv2 -r /usr/share/velkprovider/velkprovider.reg /usr/share/velkprovider/velk_cimv2.mof
sfcbrepos -f
sfcbunstage -n velk/cimv2 -r velkprovider.reg velk_cimv2.mof
sfcbrepos -f"
  : >"$place/calls"
  tool sfcbstage 1
  in_root -i "$(package velkprovider)"
  grep -q 'velkprovider: staging failed' "$place/out" || fail "a failure is not told" "$(cat "$place/out")"
  expect "calls after a failure" "$(wc -l <"$place/calls")" 1
}

"case_$1"

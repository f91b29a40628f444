# shellcheck shell=bash
# The servers that packages can be fetched from: getting their programs, and running one of them on
# the loopback interface. Sourced, or run to get the programs alone: bash scripts/servers.sh

# shellcheck source=scripts/packages.sh
source "$(dirname -- "${BASH_SOURCE[0]}")/packages.sh"

readonly servers_folder=$root/build/servers

# server_program NAME: its path, if it is here.
server_program() {
  local path
  for path in "/usr/sbin/$1" "$servers_folder/usr/sbin/$1"; do
    [[ ! -x $path ]] || { say "$path" && return; }
  done
  return 1
}

# Gets the programs that are missing. Their packages are unpacked and not installed: installed, they
# would start servers of their own for all the world.
ensure_servers() {
  local program package log=$root/build/logs/servers.log
  mkdir -p "$servers_folder" "$root/build/logs"
  for package in atftpd:atftpd openssh-server:sshd; do
    program=${package#*:} package=${package%:*}
    server_program "$program" >/dev/null && continue
    say "Unpacking: $package"
    if ! (cd "$servers_folder" && apt-get download "$package" && dpkg -x "$package"_*.deb .) >"$log" 2>&1; then
      tail -n 20 "$log" >&2
      die "$package cannot be had; if the package lists are old, apt-get update helps. The whole log is $log"
    fi
  done
}

# As root, servers run as nobody: they need no rights but to read what they serve.
server_user=$EUID
server_group=$(id -g)
((EUID)) || server_user=65534 server_group=65534
as_server() {
  if ((EUID)); then
    exec "$@"
  else
    exec setpriv --reuid "$server_user" --regid "$server_group" --clear-groups -- "$@"
  fi
}

# listens KIND PORT: whether somebody does on 127.0.0.1; KIND is tcp or udp.
listens() {
  grep -q "^ *[0-9]*: 0100007F:$(printf %04X "$2") " "/proc/net/$1"
}

# comes_up KIND PORT: waits for the server, up to ten seconds; fails if it ends.
comes_up() {
  local look
  for ((look = 0; look < 200; look++)); do
    ! listens "$1" "$2" || return 0
    kill -0 "$server" 2>/dev/null || return 1
    sleep 0.05
  done
  return 1
}

# start_server KIND COMMAND LOG: runs COMMAND PORT, which becomes the server, with a free port. Sets
# `server`, its process, and `port`.
start_server() {
  local kind=$1 command=$2 log=$3 try
  for ((try = 0; try < 10; try++)); do
    port=$((20000 + (RANDOM * 32768 + RANDOM) % 40000))
    ! listens "$kind" "$port" || continue
    ("$command" "$port") >"$log" 2>&1 </dev/null &
    server=$!
    ! comes_up "$kind" "$port" || return 0
    stop_server
  done
  tail -n 20 "$log" >&2
  die "The server did not start."
}

stop_server() {
  [[ ${server-} ]] || return 0
  kill "$server" 2>/dev/null || true
  wait "$server" 2>/dev/null || true
  server=''
}

if [[ ${BASH_SOURCE[0]} == "$0" ]]; then
  set -euo pipefail
  ensure_packages remote
  ensure_servers
fi

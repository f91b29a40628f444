# shellcheck shell=bash
# A request over the network, from a real server of its own: serve_tftp or serve_sftp, then the
# request to $remote_base/NAME.xml with the scenario $remote_scenario. Sourced, never run.
# Both functions take the scenario to begin with and the folder of the packages.

# shellcheck source=scripts/servers.sh
source "$(dirname -- "${BASH_SOURCE[0]}")/servers.sh"

place=''  # of this run, in /tmp, as locations are short
# What comes out:
export remote_base='' remote_scenario=''

clean_up_remote() {
  stop_server
  [[ ! $place ]] || rm -rf -- "$place"
}

# What both kinds have; the packages lie in $place/p then, where any user can read them.
begin_remote() {
  trap clean_up_remote EXIT
  place=$(mktemp -d /tmp/velk-XXXXXX)
  chmod 755 "$place"
  cp -r -- "$2" "$place/p"
  chmod -R a+rX "$place/p"
  remote_scenario=$place/scenario.toml
  # A slow line, so that there is something to see.
  { cat "$1" && printf '\n[file_transfer]\nbytes_per_second = 8192\n'; } >"$remote_scenario"
}

tftp_command() {
  as_server "$(server_program atftpd)" --daemon --no-fork --logfile - --bind-address 127.0.0.1 \
    --port "$1" --user "$(id -un "$server_user").$(getent group "$server_group" | cut -d: -f1)" "$place/p"
}

serve_tftp() {
  begin_remote "$@"
  start_server udp tftp_command "$place/server.log"
  remote_base=tftp://127.0.0.1:$port
}

# The server's keys and its one user, who is no account of this machine (nss_wrapper).
write_sftp_files() {
  local name
  for name in host user; do
    ssh-keygen -q -t ed25519 -N '' -f "$place/$name"
  done
  say "velk:x:$server_user:$server_group::$place:/bin/sh" >"$place/passwd"
  say "velk:x:$server_group:" >"$place/group"
  cat >"$place/sshd_config" <<TEXT
ListenAddress 127.0.0.1
HostKey $place/host
AuthorizedKeysFile $place/user.pub
AuthenticationMethods publickey
PidFile none
UsePAM no
StrictModes no
UseDNS no
Subsystem sftp internal-sftp
TEXT
  ((EUID)) || chown "$server_user:$server_group" "$place/host"
}

sftp_command() {
  export LD_PRELOAD=libnss_wrapper.so NSS_WRAPPER_PASSWD=$place/passwd NSS_WRAPPER_GROUP=$place/group
  as_server "$(server_program sshd)" -D -e -f "$place/sshd_config" -p "$1"
}

serve_sftp() {
  begin_remote "$@"
  write_sftp_files
  start_server tcp sftp_command "$place/server.log"
  say "[127.0.0.1]:$port $(cut -d' ' -f1,2 "$place/host.pub")" >"$place/known_hosts"
  cat >>"$remote_scenario" <<TEXT
user = "velk"
private_key = "$place/user"
known_hosts = "$place/known_hosts"
TEXT
  remote_base=sftp://127.0.0.1:$port$place/p
}

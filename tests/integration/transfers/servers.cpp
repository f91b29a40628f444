#include "tests/integration/transfers/servers.h"

#include <crypt.h>
#include <grp.h>
#include <pwd.h>
#include <unistd.h>

#include <fstream>
#include <stdexcept>

#include "tests/integration/velkhost/process.h"

namespace velkhost::testing {
namespace {

namespace fs = std::filesystem;

// atftpd wants to be told by name who it is already.
std::string account_name() {
    const passwd *user = getpwuid(Daemon::user());
    const group *group = getgrgid(Daemon::group());
    if (user == nullptr || group == nullptr) {
        throw std::runtime_error("the user that runs the tests has no name");
    }
    return std::string(user->pw_name) + "." + group->gr_name;
}

void run(const std::vector<std::string> &command) {
    const Finished finished = Process::on_pipes(command, {}).wait();
    if (finished.exit_code != 0) {
        throw std::runtime_error(command[0] + ": " + finished.err);
    }
}

}  // namespace

TftpServer::TftpServer(const fs::path &folder, const fs::path &place) : port_(free_udp_port()) {
    const fs::path log = place / "tftp.log";
    std::ofstream(log).close();
    fs::permissions(log, fs::perms(0666));
    daemon_ = std::make_unique<Daemon>(
        std::vector<std::string>{VELK_ATFTPD, "--daemon", "--no-fork", "--logfile", "-",
                                 "--bind-address", "127.0.0.1", "--port", std::to_string(port_),
                                 "--user", account_name(), folder.string()},
        log);
    wait_for_udp(port_, log);
}

SftpServer::SftpServer(const fs::path &place) : place_(place), port_(free_tcp_port()) {
    for (const char *key : {"host", "other", "user", "stranger"}) {
        make_key(key);
    }
    write("authorized", public_key("user"));
    write_accounts();
    start();
}

void SftpServer::make_key(const std::string &name) const {
    run({"/usr/bin/ssh-keygen", "-q", "-t", "ed25519", "-N", "", "-f", (place_ / name).string()});
}

std::string SftpServer::public_key(const std::string &name) const {
    std::ifstream file(place_ / (name + ".pub"));
    std::string line;
    std::getline(file, line);
    return line;
}

void SftpServer::write(const std::string &name, const std::string &text) const {
    std::ofstream(place_ / name) << text << '\n';
}

void SftpServer::write_accounts() const {
    const std::string uid = std::to_string(Daemon::user());
    const std::string gid = std::to_string(Daemon::group());
    const std::string user = kUser;
    write("passwd", user + ":x:" + uid + ":" + gid + "::" + place_.string() + ":/bin/sh");
    write("group", user + ":x:" + gid + ":");
    crypt_data scratch{};
    const char *hash = crypt_r(kPassword, "$6$velkvelk", &scratch);
    write("shadow", user + ":" + (hash == nullptr ? "*" : hash) + ":19000:0:99999:7:::");
}

void SftpServer::start() {
    const std::string place = place_.string();
    write("sshd_config", "ListenAddress 127.0.0.1\nPort " + std::to_string(port_) + "\nHostKey " +
                             place + "/host\nAuthorizedKeysFile " + place +
                             "/authorized\nPidFile none\nUsePAM no\nStrictModes no\n"
                             "PasswordAuthentication yes\nKbdInteractiveAuthentication no\n"
                             "UseDNS no\nMaxStartups 100\nSubsystem sftp internal-sftp");
    const fs::path log = place_ / "sshd.log";
    std::ofstream(log).close();
    fs::permissions(log, fs::perms(0666));
    if (geteuid() == 0) {  // the server runs as another user
        for (const char *key : {"host", "shadow"}) {
            if (chown((place_ / key).c_str(), Daemon::user(), Daemon::group()) != 0) {
                throw std::runtime_error("cannot give the server its files");
            }
        }
    }
    daemon_ = std::make_unique<Daemon>(
        std::vector<std::string>{VELK_SSHD, "-D", "-e", "-f", place + "/sshd_config"}, log,
        std::map<std::string, std::string>{{"LD_PRELOAD", "libnss_wrapper.so"},
                                           {"NSS_WRAPPER_PASSWD", place + "/passwd"},
                                           {"NSS_WRAPPER_GROUP", place + "/group"},
                                           {"NSS_WRAPPER_SHADOW", place + "/shadow"}});
    wait_for_tcp(port_, log);
}

fs::path SftpServer::known_hosts(std::uint16_t port) const {
    write("known_hosts", "[127.0.0.1]:" + std::to_string(port) + " " + public_key("host"));
    return place_ / "known_hosts";
}

fs::path SftpServer::wrong_known_hosts() const {
    write("wrong_known_hosts", "[127.0.0.1]:" + std::to_string(port_) + " " + public_key("other"));
    return place_ / "wrong_known_hosts";
}

}  // namespace velkhost::testing

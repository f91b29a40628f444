#include "tests/integration/wbem/wbem_fixture.h"

#include <csignal>
#include <regex>

namespace velkhost::testing {

void WbemTest::serve(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), {"serve", "--listen", "127.0.0.1:0"});
    if (std::find(arguments.begin(), arguments.end(), "--scenario") == arguments.end()) {
        arguments.insert(arguments.end(), {"--scenario", std::string(kScenarios) + "default.toml"});
    }
    host_.emplace(Process::on_pipes(command(arguments), environment()));
    const bool listens = host_->read_until("/cimom\n");
    std::smatch match;
    const std::regex form(R"(listening on http://127\.0\.0\.1:(\d+)/cimom)");
    if (!listens || !std::regex_search(host_->out(), match, form)) {
        const Finished finished = host_->wait();
        host_.reset();
        FAIL() << finished.out << finished.err;
    }
    port_ = static_cast<std::uint16_t>(std::stoul(match[1]));
}

Finished WbemTest::stop(int signal) {
    host_->send_signal(signal);
    Finished finished = host_->wait();
    host_.reset();
    return finished;
}

void WbemTest::TearDown() {
    if (host_) {
        const Finished finished = stop();
        EXPECT_EQ(finished.exit_code, 0) << finished.out << finished.err;
    }
    EXPECT_TRUE(run_folders().empty());
    VelkhostTest::TearDown();
}

std::string WbemTest::place(const std::string &name_space) const {
    return "http://127.0.0.1:" + std::to_string(port_) + '/' + name_space;
}

Finished WbemTest::wbemcli(const std::vector<std::string> &arguments) {
    std::vector<std::string> line = {"/usr/bin/wbemcli"};
    line.insert(line.end(), arguments.begin(), arguments.end());
    return Process::on_pipes(line, environment()).wait();
}

std::string WbemTest::ask(const std::vector<std::string> &arguments) {
    const Finished finished = wbemcli(arguments);
    EXPECT_EQ(finished.exit_code, 0) << finished.out << finished.err;
    return finished.out;
}

std::string WbemTest::complaint(const std::vector<std::string> &arguments) {
    const Finished finished = wbemcli(arguments);
    EXPECT_NE(finished.exit_code, 0) << finished.out;
    std::smatch match;
    const std::regex form("\\* \\S*wbemcli: (?:Cim: )?(.*)\n");
    return std::regex_search(finished.err, match, form) ? match[1].str() : finished.err;
}

std::string WbemTest::service() {
    const std::string path = ask({"ein", place() + kService});
    return "http://" + path.substr(0, path.find('\n'));
}

std::vector<std::string> WbemTest::install_call(const std::string &location,
                                                const std::string &more) {
    return {"cm", service(), "InstallFromURI.URI=\"" + location + "\"" + more};
}

std::string WbemTest::job_property(const std::string &id, const std::string &name) {
    const std::string text =
        ask({"gi", place() + ":ZEB_ConcreteJob.InstanceID=\"" + id + "\"", name});
    std::smatch match;
    const std::regex form(" " + name + "=(.*)\n");
    return std::regex_search(text, match, form) ? match[1].str() : "no " + name + " in " + text;
}

}  // namespace velkhost::testing

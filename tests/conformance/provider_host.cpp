#include "tests/conformance/provider_host.h"

#include <unistd.h>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <ctime>

#include "host/providers/kit/cim_error.h"
#include "host/shim/velkshim.h"
#include "tests/support/log_text.h"

namespace velktest {
namespace fs = std::filesystem;

namespace {

constexpr std::int64_t kMicroseconds = 1'000'000;
constexpr std::int64_t kDay = 86'400;

// 2024-10-04, 08:05:03 UTC.
constexpr std::int64_t kStart = (20'000 * kDay + kStartSecond) * kMicroseconds;

constexpr const char *kJobLibrary = "/usr/lib/cim/libconcretejob.so";
constexpr const char *kProvider = "/usr/lib/cim/libvelkprovider.so";

int name_next_job(char *id, int size, const char *) {
    static std::atomic<int> last{0};
    std::snprintf(id, static_cast<std::size_t>(size), "VELK-%d", ++last);
    return 0;
}

velkhost::broker::BrokerOptions broker_options() {
    velkhost::broker::BrokerOptions options;
    options.provider_folders = {"/usr/lib/cim"};
    return options;
}

void require(const std::string &error) {
    if (!error.empty()) {
        throw std::runtime_error(error);
    }
}

void add_class(velkhost::broker::Broker &broker, const std::string &name_space,
               const std::string &class_name) {
    cim::ClassDecl declaration;
    declaration.name = class_name;
    require(broker.repository().add_class(name_space, declaration));
}

}  // namespace

// The double of the job library runs this.
extern "C" [[gnu::visibility("default")]] int velktest_create_job(char *instance_id, int size,
                                                                  const char *record) {
    return ProviderHost::create_job()(instance_id, size, record);
}

kit::MethodResult FileTransferService::invoke(const kit::Path &, const std::string &method,
                                              const kit::Args &) {
    const auto found = answers.find(method);
    const MethodEnd end = found == answers.end() ? MethodEnd{} : found->second;
    if (end.code != CMPI_RC_OK) {
        throw kit::CimError(end.code, end.message);
    }
    return {end.value, end.outputs};
}

ProviderHost::ProviderHost() : broker_(broker_options()) {
    setenv("TZ", "UTC", 1);
    tzset();
    furnish();
    require(velkshim_set_root((folder() / "root").c_str()) == 0 ? "" : "no root");
    velkshim_use_virtual_clock(kStart);
    velkshim_thread_enter();
    watch();
    fail_service("", "", 0);
    add_class(broker_, kNamespace, kClass);
    require(broker_.register_providers(VELK_REGISTRATION));
    add_service(controller_);
    add_service(job_);
    add_service(transfer_);
    require(broker_.load_providers().message);
    library_ = dlopen(kProvider, RTLD_NOW | RTLD_NOLOAD);
    require(library_ == nullptr ? "the library is not loaded" : "");
}

ProviderHost::~ProviderHost() {
    broker_.shutdown();
    velkshim_set_fault_hook(nullptr, nullptr);
    velkshim_observe_files(nullptr, nullptr);
    velkshim_observe_pauses(nullptr, nullptr);
    velkshim_thread_leave();
    velkshim_use_real_clock();
    velkshim_set_root(nullptr);
    create_job() = &name_next_job;
}

void ProviderHost::furnish() const {
    for (const char *name : {"/tmp/sfcb", "/var/tmp", "/usr/lib/cim"}) {
        fs::create_directories(at(name));
    }
    fs::create_symlink(VELK_PROVIDER_LIBRARY, at(kProvider));
    fs::create_symlink(VELK_FAKE_JOB_LIBRARY, at(kJobLibrary));
}

void ProviderHost::watch() {
    velkshim_observe_pauses(&ProviderHost::note_pause, this);
    velkshim_observe_files(&ProviderHost::note_file, this);
    velkshim_set_fault_hook(&ProviderHost::strike, this);
}

void ProviderHost::add_service(DoubleBase &service) {
    constexpr const char *kServices = "zeb/cimv2";
    add_class(broker_, kServices, service.class_name());
    broker_.register_provider(kServices, service.class_name(), service.interfaces(broker_.cmpi()));
}

velkhost::broker::MethodReply ProviderHost::call(const std::string &method,
                                                 const cim::NamedValues &in,
                                                 const std::string &class_name) {
    return broker_.invoke_method(service_path(class_name), method, in);
}

bool ProviderHost::wait_until_idle(Seconds limit) {
    const Seconds end = now() + limit;
    while (value("Velkchild_thread_num") > 0) {
        if (now() >= end) {
            return false;
        }
        pause(1);
    }
    pause(1);  // the thread counts itself out shortly before it ends
    return true;
}

void *ProviderHost::symbol(const char *name) const {
    void *found = dlsym(library_, name);
    require(found == nullptr ? std::string("the library has no ") + name : "");
    return found;
}

fs::path ProviderHost::at(std::string_view fixed_path) const {
    return folder() / "root" / fixed_path.substr(1);
}

std::string ProviderHost::log() const {
    return read_file(at("/tmp/velkdebug.txt"));
}

void ProviderHost::clear_log() const {
    fs::remove(at("/tmp/velkdebug.txt"));
}

Seconds ProviderHost::since_start(std::int64_t time_us) const {
    return static_cast<Seconds>(time_us - kStart) / static_cast<Seconds>(kMicroseconds);
}

Seconds ProviderHost::now() const {
    return since_start(velkshim_now_us());
}

void ProviderHost::pause(Seconds length) const {
    usleep(static_cast<useconds_t>(std::llround(length * static_cast<Seconds>(kMicroseconds))));
}

std::vector<Pause> ProviderHost::pauses_of(const PauseLog &log) const {
    std::vector<Pause> pauses;
    for (const PauseLog::Entry &entry : log.entries()) {
        pauses.push_back({since_start(entry.at_us), static_cast<Seconds>(entry.length_us) /
                                                        static_cast<Seconds>(kMicroseconds)});
    }
    return pauses;
}

std::vector<Pause> ProviderHost::own_pauses() const {
    return pauses_of(own_pauses_);
}

std::vector<Pause> ProviderHost::other_pauses() const {
    return pauses_of(other_pauses_);
}

std::vector<FileWrite> ProviderHost::status_writes() const {
    const std::lock_guard lock(lock_);
    return writes_;
}

int ProviderHost::passes(const std::string &step) const {
    const std::lock_guard lock(lock_);
    const auto found = passes_.find(step);
    return found == passes_.end() ? 0 : found->second;
}

int ProviderHost::uses(const std::string &step) const {
    const std::lock_guard lock(lock_);
    const auto found = uses_.find(step);
    return found == uses_.end() ? 0 : found->second;
}

void ProviderHost::fail_step(const std::string &step, int error) {
    const std::lock_guard lock(lock_);
    failing_steps_[step] = error;
}

void ProviderHost::fail_service(const std::string &step, const std::string &subject, int code,
                                const std::string &message) {
    using velkhost::broker::Fault;
    broker_.set_fault_hook([=, this](std::string_view asked_step, std::string_view asked_subject) {
        const std::lock_guard lock(lock_);
        ++uses_[std::string(asked_step)];
        const bool is_meant = asked_step == step && asked_subject == subject;
        return is_meant ? std::optional(Fault{code, message}) : std::nullopt;
    });
}

void ProviderHost::install_job_library(const fs::path &library) {
    remove_job_library();
    fs::create_symlink(library, at(kJobLibrary));
}

void ProviderHost::remove_job_library() {
    fs::remove(at(kJobLibrary));
}

CreateJob &ProviderHost::create_job() {
    static CreateJob function = &name_next_job;
    return function;
}

std::vector<std::string> ProviderHost::up_calls() {
    using velkhost::broker::TraceEntry;
    std::vector<std::string> calls;
    for (const TraceEntry &entry : broker_.trace().entries()) {
        if (entry.side == TraceEntry::Side::kUpCall) {
            const std::string method = entry.method.empty() ? "" : "." + entry.method;
            calls.push_back(entry.operation + " " + entry.name_space + ":" + entry.class_name +
                            method + "(" + entry.arguments + ")");
        }
    }
    return calls;
}

void ProviderHost::note_pause(void *host, std::int64_t now_us, std::int64_t length_us) {
    auto &self = *static_cast<ProviderHost *>(host);
    const bool own = std::this_thread::get_id() == self.owner_;
    (own ? self.own_pauses_ : self.other_pauses_).add(now_us, length_us);
}

void ProviderHost::note_file(void *host, const char *path, std::int64_t now_us) {
    auto &self = *static_cast<ProviderHost *>(host);
    if (std::string_view(path).starts_with("/tmp/sfcb/velkstat")) {
        const std::string text = read_file(self.at(path));
        const std::lock_guard lock(self.lock_);
        self.writes_.push_back({self.since_start(now_us), path, text});
    }
}

int ProviderHost::strike(void *host, const char *step) {
    auto &self = *static_cast<ProviderHost *>(host);
    const std::lock_guard lock(self.lock_);
    ++self.passes_[step];
    const auto failing = self.failing_steps_.find(step);
    return failing == self.failing_steps_.end() ? 0 : failing->second;
}

}  // namespace velktest

#include "host/rig/rig.h"

#include "host/bmc/scenario_device.h"
#include "host/rig/broker_setup.h"
#include "host/rig/library_state.h"
#include "host/rig/shim_session.h"
#include "host/rig/text_file.h"
#include "host/scenario/reader.h"

#include <algorithm>
#include <atomic>
#include <utility>

namespace velkhost::rig {
namespace {

constexpr const char *kLibrary = "/usr/lib/cim/libvelkprovider.so";
constexpr const char *kNamespace = "velk/cimv2";

std::string joined(const std::vector<std::string> &texts) {
    std::string result;
    for (const std::string &text : texts) {
        result += (&text == texts.data() ? "" : "|") + text;
    }
    return result;
}

cim::NamedValues arguments_of(const InstallRequest &request) {
    cim::NamedValues in = {{"URI", cim::Value::string(joined(request.uris))}};
    if (request.options) {
        cim::Value::Array elements;
        for (const std::uint16_t option : *request.options) {
            elements.push_back(cim::Value::uint16(option));
        }
        in.set("InstallOptions", cim::Value::array(CMPI_uint16, std::move(elements)));
    }
    if (request.update_args) {
        in.set("UpdateArgs", cim::Value::string(*request.update_args));
    }
    return in;
}

std::optional<std::string> job_id_in(const cim::NamedValues &out) {
    const cim::Value *const job = out.find("Job");
    const cim::ObjectPath *const path = job == nullptr ? nullptr : job->as_path();
    const cim::Value *const id = path == nullptr ? nullptr : path->keys.find("InstanceID");
    const auto text = id == nullptr ? std::nullopt : id->as_text();
    return text ? std::optional<std::string>(*text) : std::nullopt;
}

InstallAnswer to_answer(const broker::MethodReply &reply) {
    InstallAnswer answer{reply.status, std::nullopt, job_id_in(reply.out)};
    if (reply.return_value) {
        if (const auto number = reply.return_value->as_unsigned()) {
            answer.return_value = static_cast<std::uint32_t>(*number);
        }
    }
    return answer;
}

std::shared_ptr<scenario::Scenario> make_scenario(const RigOptions &options) {
    if (options.scenario_file) {
        return std::make_shared<scenario::Scenario>(
            scenario::read_description(options.scenario_file->string()));
    }
    return std::make_shared<scenario::Scenario>(
        options.description.value_or(scenario::Description{}));
}

std::string scenario_text(const RigOptions &options) {
    return options.scenario_file ? read_text_file(*options.scenario_file).value_or("")
                                 : std::string();
}

// The one place of the process for a rig.
class Claim {
  public:
    Claim() {
        if (taken().exchange(true)) {
            throw RigError("there is a stand-in host in this process already");
        }
    }
    ~Claim() { taken().store(false); }
    Claim(const Claim &) = delete;
    Claim &operator=(const Claim &) = delete;

  private:
    static std::atomic<bool> &taken() {
        static std::atomic<bool> value{false};
        return value;
    }
};

// The scenario that the providers and the job library find.
class CurrentScenario {
  public:
    explicit CurrentScenario(std::shared_ptr<scenario::Scenario> scenario)
        : scenario_(std::move(scenario)) {
        scenario::Scenario::set_current(scenario_);
    }
    ~CurrentScenario() { scenario::Scenario::set_current(nullptr); }
    CurrentScenario(const CurrentScenario &) = delete;
    CurrentScenario &operator=(const CurrentScenario &) = delete;

    [[nodiscard]] scenario::Scenario &get() const { return *scenario_; }

  private:
    std::shared_ptr<scenario::Scenario> scenario_;
};

}  // namespace

// In the order of setting up; undone the other way round.
struct Rig::State {
    explicit State(const RigOptions &options)
        : virtual_clock(options.virtual_clock),
          current(make_scenario(options)),
          folder(options.folder ? RunFolder::at(*options.folder) : RunFolder::make_temporary()) {}

    // A broker can be had only once the root is in place.
    void start(const RigOptions &options) {
        const Parts parts = options.parts ? *options.parts : Parts::around_this_program();
        folder.furnish(parts.libraries, scenario_text(options));
        broker = make_broker(parts, current.get());
        session.emplace(folder.path(), current.get(), virtual_clock, history);
        controller.emplace(current.get());
    }

    [[nodiscard]] std::optional<LibraryState> library() const {
        return LibraryState::look(folder.inside(kLibrary).string());
    }

    Claim claim;
    const bool virtual_clock;
    CurrentScenario current;
    RunFolder folder;
    StatusHistory history;
    std::optional<ShimSession> session;
    std::optional<bmc::ScenarioDevice> controller;
    std::unique_ptr<broker::Broker> broker;
    std::int64_t request_start_us = 0;
    std::vector<bmc::Exchange> controller_trace;  // once the host is down
};

Rig::Rig(RigOptions options) : state_(std::make_unique<State>(options)) {
    state_->start(options);
}

Rig::~Rig() {
    if (!shut_down()) {
        // Install threads still use all of it.
        [[maybe_unused]] State *const left_behind = state_.release();
    }
}

InstallAnswer Rig::install(const InstallRequest &request) {
    const auto services =
        broker().enumerate_instance_names({{}, kNamespace, "PAKRO_VMpkgInstallationService", {}});
    if (!services.status.ok() || services.paths.empty()) {
        throw RigError("the broker has no installation service: " +
                       (services.status.ok() ? "the class has no instance"
                                             : std::to_string(services.status.code) + " " +
                                                   services.status.message));
    }
    if (!busy()) {
        state_->history.clear();
        state_->request_start_us = host_now_us();
    }
    return to_answer(
        broker().invoke_method(services.paths.front(), "InstallFromURI", arguments_of(request)));
}

bool Rig::busy() const {
    const auto library = state_->library();
    return library && library->running_installs() > 0;
}

bool Rig::wait_until_idle(std::chrono::microseconds limit, const std::function<void()> &on_tick) {
    constexpr std::int64_t kVirtualStep = 10'000'000;
    constexpr std::int64_t kRealStep = 100'000;
    const std::int64_t step = state_->virtual_clock ? kVirtualStep : kRealStep;
    const std::int64_t deadline = state_->request_start_us + limit.count();
    while (busy()) {
        const std::int64_t left = deadline - host_now_us();
        if (left <= 0) {
            return false;
        }
        host_pause_us(std::min(step, left));
        if (on_tick) {
            on_tick();
        }
    }
    // The thread counts itself out shortly before it ends.
    host_pause_us(state_->virtual_clock ? 0 : kRealStep);
    return true;
}

std::int64_t Rig::last_activity_us() const {
    // A log that cannot be written tells nothing.
    const std::int64_t last = state_->session ? state_->session->last_log_us() : 0;
    return last == 0 ? host_now_us() : last;
}

std::vector<PackageStatus> Rig::results() const {
    const auto library = state_->library();
    if (library && library->running_installs() == 0) {
        return library->results();
    }
    const auto entries = state_->history.entries();
    return entries.empty() ? std::vector<PackageStatus>{} : entries.back().line.packages;
}

std::optional<JobView> Rig::job(const std::string &id) {
    const auto reply = broker().get_instance(
        {{}, kNamespace, "ZEB_ConcreteJob", {{"InstanceID", cim::Value::string(id)}}});
    if (!reply.status.ok() || !reply.instance) {
        return std::nullopt;
    }
    JobView view;
    const cim::NamedValues &properties = reply.instance->properties;
    if (const cim::Value *const state = properties.find("JobState")) {
        const auto number = state->as_unsigned();
        view.state = number ? std::optional(static_cast<std::uint16_t>(*number)) : std::nullopt;
    }
    if (const cim::Value *const status = properties.find("JobStatus")) {
        view.status = status->as_text().value_or("");
    }
    return view;
}

broker::Broker &Rig::broker() {
    return *state_->broker;
}

scenario::Scenario &Rig::scenario() {
    return state_->current.get();
}

StatusHistory &Rig::history() {
    return state_->history;
}

std::vector<bmc::Exchange> Rig::controller_trace() const {
    return state_->controller ? state_->controller->trace() : state_->controller_trace;
}

RunFolder &Rig::folder() {
    return state_->folder;
}

const RunFolder &Rig::folder() const {
    return state_->folder;
}

std::filesystem::path Rig::library_path() const {
    return state_->folder.inside(kLibrary);
}

bool Rig::shut_down() {
    if (!state_->session) {
        return true;
    }
    if (busy()) {
        return false;
    }
    state_->broker->shutdown();
    state_->controller_trace = state_->controller->trace();
    state_->controller.reset();
    state_->session.reset();
    return true;
}

std::vector<std::string> Rig::findings() const {
    std::vector<std::string> lines;
    for (const broker::Finding &finding : state_->broker->ledger().findings()) {
        lines.push_back(broker::to_text(finding));
    }
    return lines;
}

std::vector<std::string> Rig::unfired_faults() const {
    std::vector<std::string> lines;
    const scenario::Scenario &scenario = state_->current.get();
    for (const scenario::FaultRule &rule : scenario.faults.unfired()) {
        lines.push_back(scenario.source + ":" + std::to_string(rule.line) + ": " + rule.step +
                        (rule.match.empty() ? "" : " (" + rule.match + ")"));
    }
    return lines;
}

}  // namespace velkhost::rig

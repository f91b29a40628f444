// What a scenario says, as plain data: the host, how each of its services answers in turn, and the
// faults that strike. Filled by the reader; the running parts (AnswerBook, FaultRules) take copies.
#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

#define VELKSCENARIO_API [[gnu::visibility("default")]]

namespace velkhost::scenario {

// A scenario file that cannot be used; what() reads "file:line: message".
class VELKSCENARIO_API ScenarioError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

// [host]
struct HostSettings {
    std::string node = "esxi-01.example.com";    // node name that the host reports, 1 to 64 bytes
    std::int64_t start_us = 1772438400'000'000;  // virtual clock's first moment, us since 1970 UTC
};

// [jobs]: the job library.
struct JobSettings {
    std::uint32_t poll_seconds = 10;  // pause between two queries of a job's status function
    std::uint32_t first_number = 1;   // number of the first job: 1 gives "VELK-1"
};

// [file_transfer]. All paths are absolute.
struct FileTransferSettings {
    // Files that count as transferred by the service before the run began.
    std::vector<std::string> transferred;
    // How the service shows other machines who it is, unless a location itself says so.
    std::optional<std::string> user;
    std::optional<std::string> password;
    std::optional<std::string> private_key;  // file of an SSH key without a passphrase
    // File of the SSH servers that the service trusts (sshd(8)); no value: it trusts none.
    std::optional<std::string> known_hosts;
    std::uint32_t connect_seconds = 30;     // real time that a server has to let the service in
    std::uint32_t stall_seconds = 60;       // for how long nothing may come
    std::uint32_t bytes_per_second = 0;     // speed of the link by the host's clock; 0: endless
    std::optional<std::uint32_t> capacity;  // bytes that the file store takes; no value: its disk
    std::uint32_t at_once = 4;              // how many jobs transfer at the same time
};

// DMTF job states (CIM_ConcreteJob.JobState) that the services use.
inline constexpr std::uint16_t kJobRunning = 4;
inline constexpr std::uint16_t kJobCompleted = 7;
inline constexpr std::uint16_t kJobException = 10;

// What one or more reads of a job's instance see.
struct JobLook {
    std::optional<std::string> job_status;  // no value: the property is null
    std::uint16_t job_state = kJobRunning;
    std::uint32_t looks = 1;                              // how many reads in a row see this
    bool absent = false;                                  // the job's instance cannot be had
    std::optional<std::uint16_t> percent = std::nullopt;  // no value: the property is null
};

// Return value of CIM_SoftwareInstallationService methods: parameters checked, job started.
inline constexpr std::uint32_t kJobStarted = 4096;

// How a service installs what it is given.
enum class ServiceKind {
    kJob,     // a job, whose instance clients read
    kStatus,  // an update, whose status clients ask the service for
    kAtOnce,  // all is over when the call returns
};

// What a service returns when all is well.
constexpr std::uint32_t usual_return_value(ServiceKind kind) {
    return kind == ServiceKind::kAtOnce ? 0 : kJobStarted;
}

// Statuses of an update that has no job.
inline constexpr std::uint16_t kUpdateDone = 0;
inline constexpr std::uint16_t kUpdateRunning = 1;

// What an installation service answers to one call, and what its job reports from then on.
struct ServiceAnswer {
    std::string match;  // part of the URIs that this answer is for; empty for the rest
    std::uint32_t return_value = kJobStarted;
    int status = 0;       // CIM status of the call (DSP0200); 0 is success
    std::string message;  // message of a failed status
    // No value: the service's usual job. Empty: no job, although the answer says that one started.
    // The last look holds for ever.
    std::optional<std::vector<JobLook>> job;
};

// [hypervisor]: the hypervisor's own installation service, for bundles of its updates.
struct HypervisorSettings {
    // The systems that have such a service, in the order of an enumeration; no value: the host.
    std::optional<std::vector<std::string>> systems;
    std::vector<std::string> installed;     // packages (VIBs) that are there: "NAME VERSION"
    std::vector<std::string> earlier_jobs;  // JobStatus of jobs that ended before the run began
    std::vector<ServiceAnswer> answers;     // of every system's service
};

// A node of the host, with its management controller.
struct NetworkNode {
    std::string device;      // its IPMI device
    std::string hypervisor;  // addresses in the in-band network
    std::string controller;
};

// [network]: the in-band network of the host's nodes, and the component that configures it.
struct NetworkSettings {
    std::vector<NetworkNode> nodes;  // in the order of their numbers; none: there is no mapping
    std::uint32_t age_seconds = 0;   // of the mapping when the run begins
    std::optional<std::uint32_t> configure_seconds = 12;  // how long that takes; no value: for ever
};

// Families of adapters, each with a provider of its own; scenario/adapter_family.h has their names.
enum class AdapterFamily : std::size_t {
    kEmulexFc,
    kEmulexCna,
    kQlogic,
    kBrocade,
    kBroadcom,
    kLsi,
};
inline constexpr std::size_t kAdapterFamilies = 6;

// [[adapter]]: an adapter of this host, as its vendor's provider shows it. An identifier without a
// value is one that the adapter does not tell.
struct Adapter {
    AdapterFamily family = AdapterFamily::kEmulexFc;
    std::string name;                      // of the product, for people
    std::optional<std::string> dfn;        // what payloads are matched on
    std::optional<std::string> serial;     // serial number
    std::string firmware;                  // version that is installed
    std::vector<std::string> nic_ports;    // device ids of its network ports
    std::vector<std::string> fc_ports;     // device ids of its Fibre Channel ports
    std::optional<std::string> port_name;  // name of each port; no value: the serial number
    bool connectors = true;                // whether its ports' connectors are shown
    bool card = true;                      // whether the card that bears them is shown
};

// The answers of each family's service.
using AdapterAnswers = std::array<std::vector<ServiceAnswer>, kAdapterFamilies>;

// [controller]: the management controller behind the host's IPMI device.
struct ControllerSettings {
    bool present = true;             // false: the host has no such device
    std::uint32_t type = 2;          // 0: knows no sessions, 1: first generation, 2: second
    std::string secure_mode = "no";  // text of its variable, up to 127 bytes; "yes" in it: secure
};

// What a fault at a step "bmc.NAME" does.
enum class ControllerFault {
    kNone,            // the fault is none of the controller's
    kNoAnswer,        // silence; the request is not served
    kCompletionCode,  // nothing but a completion code; the request is not served
    kRefuse,          // an answer with the result flag clear; the request is not served
    kVanish,          // the device goes, for good
    kLate,            // the answer comes late
    kWrongFunction,   // the answer bears another network function
    kWrongCommand,    // the answer bears another command
    kLonger,          // the answer is filled up with zeros
};

// What a fault at the step "filetransfer.fetch" does to a transfer.
enum class TransferFault {
    kNone,    // the fault is none of a transfer's
    kRefuse,  // the server cannot be reached
    kStall,   // nothing comes any more after the first piece
    kCut,     // the file ends early
    kFull,    // the file store's disk is full
};

// A fault strikes at a named step: it lets `after` passes of the step go by, then strikes `count`
// times. A step that ends in '*' stands for all that begin so. `match` narrows it to passes whose
// subject (a URI, a class name, a job id) contains it; empty matches all.
struct FaultRule {
    static constexpr std::uint32_t kAlways = std::numeric_limits<std::uint32_t>::max();

    std::string step;
    std::string match;
    std::uint32_t after = 0;
    std::uint32_t count = 1;
    int code = 0;         // errno for a libc step, CIM status for others; see `controller`
    std::string message;  // status message, for steps that carry one
    // With kCompletionCode `code` is that code, with kLate the seconds, with kLonger the bytes.
    ControllerFault controller = ControllerFault::kNone;
    TransferFault transfer = TransferFault::kNone;
    int line = 0;  // where the rule stands in its file; 0 when it comes from elsewhere
};

struct Description {
    std::string source = "built-in default";  // the file's name as it was given
    HostSettings host;
    JobSettings jobs;
    ControllerSettings controller;
    std::vector<ServiceAnswer> management_controller;
    HypervisorSettings hypervisor;
    NetworkSettings network;
    std::vector<Adapter> adapters;
    AdapterAnswers adapter_answers;
    FileTransferSettings file_transfer;
    std::vector<FaultRule> faults;
};

}  // namespace velkhost::scenario

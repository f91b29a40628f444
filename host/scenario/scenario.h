// The scenario at work: what the stand-in host has, how each of its services answers in turn, and
// which faults strike. One per process; shared by the providers, the job library, the shim's hooks
// and the command line. Needs neither the shim nor the broker, so that the providers also run in
// any other CMPI broker.
#pragma once

#include "host/scenario/answer_book.h"
#include "host/scenario/fault_rules.h"
#include "host/scenario/model.h"

#include <deque>
#include <memory>
#include <string>
#include <vector>

namespace velkhost::scenario {

// Where a process finds its scenario unless it was given one.
inline constexpr const char *kScenarioPath = "/etc/velkhost/scenario.toml";

class VELKSCENARIO_API Scenario {
  public:
    // The settings as described, with every turn and every fault at its beginning.
    explicit Scenario(Description description = {});

    // The process's scenario. The first call reads kScenarioPath unless set_current came before; a
    // file that is not there gives the built-in default. Throws ScenarioError for one that is there
    // and cannot be used; the next call tries again. Safe from any thread.
    static std::shared_ptr<Scenario> current();

    // Makes `scenario` the process's own; nullptr: the next current() reads the file again.
    static void set_current(std::shared_ptr<Scenario> scenario);

    const std::string source;
    const HostSettings host;
    const JobSettings jobs;
    const ControllerSettings controller;
    const FileTransferSettings file_transfer;
    const HypervisorSettings hypervisor;
    const NetworkSettings network;
    const std::vector<Adapter> adapters;
    AnswerBook management_controller;
    AnswerBook hypervisor_service;
    FaultRules faults;

    // The answers of a family's service.
    AnswerBook &adapter_service(AdapterFamily family);

  private:
    std::deque<AnswerBook> adapter_services_;
};

}  // namespace velkhost::scenario

#include "host/rig/broker_setup.h"

#include "host/mof/compiler.h"
#include "host/rig/rig_error.h"

namespace velkhost::rig {
namespace {

void add_classes(broker::Repository &repository, const std::filesystem::path &file) {
    const mof::CompileResult result = mof::compile_file(file);
    if (!result.ok()) {
        throw RigError("the classes cannot be compiled:\n" + result.error_text());
    }
    for (const mof::NamespaceUnit &unit : result.units) {
        repository.add_namespace(unit.name_space);
        for (const cim::ClassDecl &declaration : unit.classes) {
            const std::string error = repository.add_class(unit.name_space, declaration);
            if (!error.empty()) {
                throw RigError(file.string() + ": " + error);
            }
        }
    }
}

broker::FaultHook fault_hook(scenario::Scenario &scenario) {
    return [&scenario](std::string_view step,
                       std::string_view subject) -> std::optional<broker::Fault> {
        const auto fault = scenario.faults.take(step, subject);
        return fault ? std::optional<broker::Fault>({fault->code, fault->message}) : std::nullopt;
    };
}

}  // namespace

std::unique_ptr<broker::Broker> make_broker(const Parts &parts, scenario::Scenario &scenario) {
    broker::BrokerOptions options;
    options.provider_folders = {"/usr/lib/cim"};
    auto made = std::make_unique<broker::Broker>(options);
    for (const std::filesystem::path &file : parts.mof_files) {
        add_classes(made->repository(), file);
    }
    for (const std::filesystem::path &file : parts.registrations) {
        const std::string error = made->register_providers(file);
        if (!error.empty()) {
            throw RigError("a registration cannot be read: " + error);
        }
    }
    made->set_fault_hook(fault_hook(scenario));
    return made;
}

}  // namespace velkhost::rig

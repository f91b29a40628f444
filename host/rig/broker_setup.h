// A broker as this host has it.
#pragma once

#include "host/broker/broker.h"
#include "host/rig/parts.h"
#include "host/scenario/scenario.h"

#include <memory>

namespace velkhost::rig {

// With the classes and registrations of `parts`; libraries are looked for in /usr/lib/cim, wherever
// that lies by then. `scenario` strikes the broker's services with its faults and must outlive the
// broker. Throws RigError.
std::unique_ptr<broker::Broker> make_broker(const Parts &parts, scenario::Scenario &scenario);

}  // namespace velkhost::rig

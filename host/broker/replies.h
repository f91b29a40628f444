// What clients of the broker get back.
#pragma once

#include "host/broker/status.h"
#include "host/cim/instance.h"

#include <optional>
#include <vector>

namespace velkhost::broker {

struct PathsReply {
    Status status;
    std::vector<cim::ObjectPath> paths;
};

struct InstancesReply {
    Status status;
    std::vector<cim::Instance> instances;
};

struct InstanceReply {
    Status status;
    std::optional<cim::Instance> instance;
};

struct PathReply {
    Status status;
    std::optional<cim::ObjectPath> path;
};

// A failed call has neither a return value nor output arguments, whatever the provider gave.
struct MethodReply {
    Status status;
    std::optional<cim::Value> return_value;  // a text keeps the type it was given with
    cim::NamedValues out;
    bool return_done = false;  // whether the provider sent returnDone
};

}  // namespace velkhost::broker

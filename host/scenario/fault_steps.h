// The names of the steps at which a fault can strike, and the codes that it can strike with.
#pragma once

#include "host/scenario/model.h"

#include <optional>
#include <string>
#include <string_view>

namespace velkhost::scenario {

// What a fault's code means to whoever serves the step.
enum class CodeKind { kErrno, kCimStatus, kController, kTransfer };

// The kind of a step's code; no value for a step that nobody serves. Known are the shim's libc
// calls ("open:/tmp/...", "thread.create"), and the steps of the broker ("broker.newObjectPath"),
// the job library, the providers and the management controller ("bmc.create").
VELKSCENARIO_API std::optional<CodeKind> step_code_kind(std::string_view step);

// The begin of every known step, for messages: "open:, unlink:, ...".
std::string known_steps();

// The number of an errno name such as "ENOSPC"; no value for a name that the system lacks.
VELKSCENARIO_API std::optional<int> errno_by_name(std::string_view name);

}  // namespace velkhost::scenario

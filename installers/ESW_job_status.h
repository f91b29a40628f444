// What the management controller's job says of an update.
#pragma once

#include <string_view>

#include "installers/job_verdict.h"

namespace velk::esw {

// `detail` is the primary part of the job's status as a number, `text` what follows it.
Verdict judge(int detail, std::string_view text);

}  // namespace velk::esw

#include "installers/job_verdict.h"

#include "velk/bounded_text.h"
#include "velk/cim.h"
#include "velk/package_table.h"

namespace velk {

void report_not_started(int index, const CMPIStatus &status) {
    Text<1024> message("Package installation error message: ");
    message.add(cim::message_of(status));
    update_Pkg_Install_status(index, status_code::kNotStarted, message.c_str());
    pkgInstance[index].OrderFlag = order_flag::kRejected;
}

}  // namespace velk

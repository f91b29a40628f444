#include <algorithm>
#include <cerrno>
#include <new>
#include <span>
#include <stdexcept>
#include <system_error>

#include "host/jobs/job_registration.h"
#include "host/jobs/job_table.h"
#include "host/providers/kit/cim_error.h"

namespace velkhost::jobs {
namespace {

int create(std::span<char> id_buffer, const JobRegistration &record) {
    auto registration = Registration::read(record);
    if (!registration) {
        return EINVAL;
    }
    const auto job = JobTable::instance().create(*std::move(registration), id_buffer.size() - 1);
    *std::ranges::copy(job->id(), id_buffer.begin()).out = '\0';
    return 0;
}

// The caller speaks C: each failure becomes a number.
int create_without_throwing(std::span<char> id_buffer, const JobRegistration &record) noexcept {
    try {
        return create(id_buffer, record);
    } catch (const std::length_error &) {
        return ERANGE;
    } catch (const std::system_error &error) {
        return error.code().value();
    } catch (const providers::CimError &error) {
        return error.code();
    } catch (const std::bad_alloc &) {
        return ENOMEM;
    } catch (const std::exception &) {
        return EIO;  // a scenario that cannot be used
    }
}

}  // namespace
}  // namespace velkhost::jobs

int create_job_instance(char *instance_id, int size, JobRegistration *registration) {
    if (instance_id == nullptr || registration == nullptr) {
        return EINVAL;
    }
    if (size <= 0) {
        return ERANGE;
    }
    return velkhost::jobs::create_without_throwing({instance_id, static_cast<std::size_t>(size)},
                                                   *registration);
}

// A CIM_SoftwareInstallationService (DSP1023): one instance, whose method InstallFromURI answers as
// the scenario says.
#pragma once

#include "host/providers/kit/job_table.h"
#include "host/providers/kit/provider.h"
#include "host/scenario/model.h"

#include <cstdint>
#include <string>
#include <vector>

namespace velkhost::providers {

// Return values of the service's methods (DSP1023).
inline constexpr std::uint32_t kInvalidParameter = 5;
inline constexpr std::uint32_t kUnsupportedTarget = 4097;
inline constexpr std::uint32_t kUriNotAccessible = 4107;

class InstallationService : public Provider {
  public:
    // Fails while the scenario is unusable. Both texts are literals.
    InstallationService(const char *class_name, const char *element_name);

    [[nodiscard]] const char *class_name() const final { return class_name_; }
    std::vector<Instance> instances() final;
    MethodResult invoke(const Path &target, const std::string &method, const Args &in) final;
    // The running updates would be forgotten.
    [[nodiscard]] bool may_unload() const final { return false; }

  protected:
    [[nodiscard]] virtual std::vector<Property> keys() const = 0;

    virtual MethodResult install(const Args &in) = 0;
    // Any method but InstallFromURI, of whatever path; there is none by default.
    virtual MethodResult call(const Path &target, const std::string &method, const Args &in);

    // Throws CimError unless the path is that of the one instance.
    void check_keys(const Path &target) const;

  private:
    const char *class_name_;
    const char *element_name_;
};

// The result of an answer by which no job starts. Throws CimError for an answer with a status.
MethodResult plain_result(const scenario::ServiceAnswer &answer);

// The same, and if the answer starts a job, that job is named in the output "Job". `usual` is the
// course of a job that the answer leaves to the service.
struct NewJob {
    const char *class_name;
    JobRequest request;
    std::vector<scenario::JobLook> usual;
};
MethodResult job_result(const scenario::ServiceAnswer &answer, JobTable &jobs, const NewJob &job);

// Whether the URI names a file of this host that can be read.
bool is_accessible(const std::string &uri);

}  // namespace velkhost::providers

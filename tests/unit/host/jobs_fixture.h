// A broker with the job library as a provider, a provider library that registers jobs, and the
// virtual clock, in which the test's own thread takes part.
#pragma once

#include <dlfcn.h>
#include <unistd.h>

#include <memory>
#include <utility>

#include "host/broker/broker.h"
#include "host/jobs/job_registration.h"
#include "host/mof/compiler.h"
#include "host/scenario/reader.h"
#include "host/scenario/scenario.h"
#include "tests/unit/host/jobs_test_provider.h"
#include "tests/unit/host/shim_fixture.h"

namespace velkhost::jobs::test {

inline constexpr std::int64_t kSecond = 1'000'000;
inline constexpr std::int64_t kEpoch = 1'600'000'000 * kSecond;

class Jobs : public shim::test::ShimRoot {
  protected:
    using CreateFunction = int(char *, int, JobRegistration *);

    Jobs() {
        velkshim_use_virtual_clock(kEpoch);
        velkshim_thread_enter();
        play("");
        const mof::CompileResult compiled = mof::compile_file(VELK_MOF_DIR "/velk_cimv2.mof");
        EXPECT_TRUE(compiled.ok()) << compiled.error_text();
        for (const mof::NamespaceUnit &unit : compiled.units) {
            for (const cim::ClassDecl &declared : unit.classes) {
                EXPECT_EQ(broker_.repository().add_class(unit.name_space, declared), "");
            }
        }
        EXPECT_EQ(broker_.register_providers(VELK_REGISTRATION), "");
        // Stays open, for the polls that may come to the very end.
        void *const provider = dlopen(VELK_JOB_TEST_PROVIDER, RTLD_NOW);
        script_ = symbol<Script *()>(provider, "job_script")();
        tell(Answer{});
        forget_calls();
    }

    ~Jobs() override {
        broker_.shutdown();
        EXPECT_EQ(broker_.ledger().report(), "");
        velkshim_set_fault_hook(nullptr, nullptr);
        velkshim_use_real_clock();
        scenario::Scenario::set_current(nullptr);
    }

    template <typename Function>
    static Function *symbol(void *library, const char *name) {
        return reinterpret_cast<Function *>(dlsym(library, name));
    }

    static void play(const std::string &text) {
        scenario::Scenario::set_current(
            std::make_shared<scenario::Scenario>(scenario::parse_description(text, "test.toml")));
    }

    static JobRegistration registration(const std::string &name = "VELK") {
        JobRegistration record{};
        name.copy(record.provider_name, 255);
        std::string(VELK_JOB_TEST_PROVIDER).copy(record.library_path, 255);
        std::string("tell_status").copy(record.status_function, 255);
        std::string("clean_up_job").copy(record.cleanup_function, 255);
        return record;
    }

    // As providers do it: the library is opened for the one call and closed behind it.
    static int create_in(char *id, int size, JobRegistration *record) {
        void *const library = dlopen(VELK_JOB_LIBRARY, RTLD_LAZY);
        const int result = symbol<CreateFunction>(library, "create_job_instance")(id, size, record);
        dlclose(library);
        return result;
    }

    static std::string create(JobRegistration record = registration()) {
        std::array<char, 300> id{};
        EXPECT_EQ(create_in(id.data(), static_cast<int>(id.size()), &record), 0);
        return id.data();
    }

    static int create_fails(JobRegistration record) {
        std::array<char, 300> id{'-'};
        const int result = create_in(id.data(), static_cast<int>(id.size()), &record);
        EXPECT_EQ(id[0], '-') << "an id was written";
        return result;
    }

    void tell(Answer answer) {
        const std::lock_guard lock(script_->mutex);
        script_->answer = std::move(answer);
    }

    void tell(int state, const std::string &message) { tell(Answer{state, message, true, 0}); }

    void forget_calls() {
        const std::lock_guard lock(script_->mutex);
        script_->asked_us.clear();
        script_->cleaned_up.clear();
    }

    // Seconds since the beginning at which the status function was called.
    [[nodiscard]] std::vector<std::int64_t> asked() const {
        const std::lock_guard lock(script_->mutex);
        std::vector<std::int64_t> seconds;
        for (const std::int64_t time_us : script_->asked_us) {
            seconds.push_back((time_us - kEpoch) / kSecond);
        }
        return seconds;
    }

    [[nodiscard]] std::vector<std::string> cleaned_up() const {
        const std::lock_guard lock(script_->mutex);
        return script_->cleaned_up;
    }

    static cim::ObjectPath path_of(const std::string &id) {
        return {"", "velk/cimv2", "ZEB_ConcreteJob", {{"InstanceID", cim::Value::string(id)}}};
    }
    static cim::ObjectPath class_path() { return {"", "velk/cimv2", "ZEB_ConcreteJob", {}}; }

    cim::NamedValues read(const std::string &id) {
        const broker::InstanceReply reply = broker_.get_instance(path_of(id));
        EXPECT_TRUE(reply.status.ok()) << id << ": " << reply.status.message;
        return reply.instance ? reply.instance->properties : cim::NamedValues{};
    }

    std::uint64_t number(const std::string &id, const char *name) {
        const cim::NamedValues values = read(id);
        const cim::Value *const value = values.find(name);
        return value == nullptr ? 999999 : value->as_unsigned().value_or(999999);
    }

    std::string text(const std::string &id, const char *name) {
        const cim::NamedValues values = read(id);
        const cim::Value *const value = values.find(name);
        return value != nullptr && value->as_text() ? std::string(*value->as_text()) : "(none)";
    }

    [[nodiscard]] std::size_t job_count() {
        return broker_.enumerate_instance_names(class_path()).paths.size();
    }

    broker::Broker broker_{{"test", {VELK_PROVIDER_DIR}}};
    Script *script_ = nullptr;
};

}  // namespace velkhost::jobs::test

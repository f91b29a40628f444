// Doubles of the providers that the library asks. Each answers what the test sets.
#pragma once

#include <cmpi/cmpift.h>

#include <deque>
#include <functional>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "host/broker/broker.h"
#include "host/providers/kit/export.h"

namespace velktest {

namespace kit = velkhost::providers;

// A provider of this process.
class DoubleBase : public kit::Provider {
  public:
    // What a broker registers; valid as long as this object.
    velkhost::broker::ManagementInterfaces interfaces(const CMPIBroker *broker);

    std::vector<kit::Instance> instances() override { return {}; }

  private:
    kit::Binding instance_binding_;
    kit::Binding method_binding_;
    CMPIInstanceMIFT instance_table_ = kit::instance_table("instanceDouble");
    CMPIMethodMIFT method_table_ = kit::method_table("methodDouble");
    CMPIInstanceMI instance_mi_{&instance_binding_, &instance_table_};
    CMPIMethodMI method_mi_{&method_binding_, &method_table_};
};

// How a method ends: with a failed status, or with a value and output arguments.
struct MethodEnd {
    CMPIrc code = CMPI_RC_OK;
    std::string message;
    std::uint32_t value = 0;
    std::vector<kit::Property> outputs;
};

// The management controller's software installation service.
class ManagementController : public DoubleBase {
  public:
    [[nodiscard]] const char *class_name() const override {
        return "ZEB_SoftwareInstallationService";
    }
    kit::MethodResult invoke(const kit::Path &target, const std::string &method,
                             const kit::Args &in) override;

    // By default it starts the job.
    MethodEnd end = {CMPI_RC_OK, "", 4096, {{"Job", kit::Reference{"ZEB_UpdateJob", {}}}}};

    // What it was asked.
    struct Order {
        std::vector<std::pair<std::string, std::string>> keys;
        std::string uri;
        int update_operation;
        int reboot_option;
    };
    std::vector<Order> orders;
};

// A job that a service starts: one look after the other, then no instance any more.
class UpdateJob : public DoubleBase {
  public:
    explicit UpdateJob(const char *class_name = "ZEB_UpdateJob") : class_name_(class_name) {}

    [[nodiscard]] const char *class_name() const override { return class_name_; }
    kit::Instance read(const kit::Path &path) override;

    // `status` is its JobStatus; null for none; no value for a job that cannot be had. `state` is
    // its JobState.
    void show(kit::Value status, kit::Value state = std::uint16_t{4}) {
        looks_.push_back(Look{{"JobStatus", std::move(status)}, {"JobState", std::move(state)}});
    }
    void show_nothing() { looks_.push_back(Look{{"JobState", std::uint16_t{4}}}); }
    void hide() { looks_.emplace_back(); }

    // Whether every look was taken.
    [[nodiscard]] bool is_over() const { return looks_.empty(); }

  private:
    using Look = std::vector<kit::Property>;
    const char *class_name_;
    std::deque<std::optional<Look>> looks_;
};

// The host's file transfer service.
class FileTransfer : public DoubleBase {
  public:
    [[nodiscard]] const char *class_name() const override { return "ZEB_FileTransferService"; }
    kit::MethodResult invoke(const kit::Path &target, const std::string &method,
                             const kit::Args &in) override;

    MethodEnd end;  // of a removal
    std::vector<std::string> deleted;

    // What becomes of a transfer of the file at `source`; none is expected unless this is set.
    std::function<MethodEnd(const std::string &source)> on_transfer;
};

// The request that a test runs in: a method whose body the test sets.
class RequestFrame {
  public:
    RequestFrame();

    velkhost::broker::ManagementInterfaces interfaces();
    std::function<void(const CMPIContext *)> work;

  private:
    CMPIMethodMIFT table_{};
    CMPIMethodMI mi_{this, &table_};
};

}  // namespace velktest

// The fixture for what needs a broker: one of this process, with the doubles of the services that
// the library asks. At the end of a test the broker's books must be clean.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "host/broker/broker.h"
#include "tests/support/library_test.h"
#include "tests/support/release_watch.h"
#include "tests/support/service_doubles.h"

namespace velktest {

class BrokerTest : public LibraryTest {
  public:
    BrokerTest();
    ~BrokerTest() override;
    BrokerTest(const BrokerTest &) = delete;
    BrokerTest &operator=(const BrokerTest &) = delete;

  protected:
    // Runs `work` inside of a request, with its context, on the calling thread. What the library
    // makes of the broker meanwhile it must have released when `work` returns.
    void in_request(const std::function<void(const CMPIContext *)> &work);

    // The service of that class answers with this status, before it is asked, from now on.
    // `step` is "broker.invokeMethod" and the like.
    void fail_service(const std::string &step, const std::string &subject, int code,
                      const std::string &message = "");

    // What the library asked of other providers, such as
    // `invokeMethod zeb/cimv2:ZEB_FileTransferService.DeleteTransferredFile(FileURI="file:///a")`.
    [[nodiscard]] std::vector<std::string> up_calls();

    void add_provider(const std::string &name_space, const std::string &class_name,
                      const velkhost::broker::ManagementInterfaces &interfaces);

    velkhost::broker::Broker &broker() { return broker_; }
    ManagementController &controller() { return controller_; }
    UpdateJob &job() { return job_; }
    FileTransfer &transfer() { return transfer_; }
    UpdateJob &transfer_job() { return transfer_job_; }

  private:
    void add_service(DoubleBase &service);

    velkhost::broker::Broker broker_;
    ReleaseWatch watch_{broker_.cmpi()};
    RequestFrame frame_;
    ManagementController controller_;
    UpdateJob job_;
    FileTransfer transfer_;
    UpdateJob transfer_job_{"ZEB_TransferJob"};
};

}  // namespace velktest

// What stands behind the path /cimom: an HTTP request in, its response out.
#pragma once

#include "host/broker/broker.h"
#include "host/cimxml/authentication.h"
#include "host/cimxml/http_message.h"
#include "host/cimxml/request.h"

#include <optional>

namespace velkhost::cimxml {

class Endpoint {
  public:
    static constexpr const char *kPath = "/cimom";

    // Without credentials everybody may ask. `broker` must outlive the endpoint.
    Endpoint(broker::Broker &broker, std::optional<Credentials> credentials);

    // Safe to call from any thread; never throws, but for memory.
    [[nodiscard]] HttpResponse answer(const HttpRequest &request) const;

  private:
    [[nodiscard]] HttpResponse answer_call(const HttpRequest &request) const;
    [[nodiscard]] std::string run(const HttpRequest &request, const Request &message) const;

    broker::Broker &broker_;
    const std::optional<Credentials> credentials_;
};

}  // namespace velkhost::cimxml

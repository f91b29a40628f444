// The extension headers of DSP0200 (6.3), and how M-POST (RFC 2774) gives them other names.
#pragma once

#include "host/cimxml/http_message.h"
#include "host/cimxml/request.h"

#include <string>

namespace velkhost::cimxml {

class CimHeaders {
  public:
    // Of a POST or M-POST. Throws MessageError 510 for an M-POST that demands another extension.
    explicit CimHeaders(const HttpRequest &request);

    // What can be said before the message is read: that this is a method call of a version spoken
    // here, in XML. Throws MessageError.
    void check_call() const;

    // Whether headers and message name the same method and object. Throws MessageError.
    void check_match(const Request &message) const;

    // Adds CIMOperation: MethodResponse, or CIMError, and what M-POST asks for besides.
    void add_operation(HttpResponse &response) const;
    void add_error(HttpResponse &response, const std::string &cim_error) const;

  private:
    [[nodiscard]] const std::string *find(const std::string &name) const;
    void add(HttpResponse &response, const std::string &name, const std::string &value) const;
    void check_content_type() const;

    const HttpRequest &request_;
    std::string prefix_;  // "73-"; empty: a POST
};

// What an OPTIONS request is told (DSP0200, 7.5).
HttpResponse capabilities();

}  // namespace velkhost::cimxml

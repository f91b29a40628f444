#include "host/cimxml/endpoint.h"

#include "host/cimxml/cim_headers.h"
#include "host/cimxml/errors.h"
#include "host/cimxml/operations.h"
#include "host/cimxml/response.h"

#include <utility>

namespace velkhost::cimxml {
namespace {

HttpResponse with_text(int status, const std::string &why) {
    HttpResponse response = bare_response(status);
    response.fields.push_back({"Content-Type", "text/plain; charset=\"utf-8\""});
    response.body = why + "\n";
    return response;
}

// "/cimom" of "http://host:5988/cimom?query" and of "/cimom".
std::string_view path_of(std::string_view target) {
    for (const std::string_view scheme : {"http://", "https://"}) {
        if (target.starts_with(scheme)) {
            target.remove_prefix(std::min(target.find('/', scheme.size()), target.size()));
        }
    }
    return target.substr(0, target.find('?'));
}

HttpResponse refused_method(const std::string &method) {
    for (const char *const known : {"GET", "HEAD", "PUT", "DELETE", "TRACE", "CONNECT", "PATCH"}) {
        if (method == known) {
            HttpResponse response = bare_response(405);
            response.fields.push_back({"Allow", "POST, M-POST, OPTIONS"});
            return response;
        }
    }
    return bare_response(501);
}

HttpResponse unauthorized() {
    HttpResponse response = bare_response(401);
    response.fields.push_back({"WWW-Authenticate", "Basic realm=\"cimom\""});
    return response;
}

// What paths in an answer call this host: what the client called it.
std::string host_name(const HttpRequest &request) {
    const std::string *const host = request.field("Host");
    return host != nullptr && !host->empty() ? *host : "localhost";
}

}  // namespace

Endpoint::Endpoint(broker::Broker &broker, std::optional<Credentials> credentials)
    : broker_(broker), credentials_(std::move(credentials)) {}

HttpResponse Endpoint::answer(const HttpRequest &request) const {
    HttpResponse response;
    if (credentials_ && !is_authorized(*credentials_, request.field("Authorization"))) {
        response = unauthorized();
    } else if (request.method == "OPTIONS") {
        response = capabilities();
    } else if (request.method != "POST" && request.method != "M-POST") {
        response = refused_method(request.method);
    } else if (path_of(request.target) != kPath) {
        response = with_text(404, "CIM operations are at /cimom");
    } else {
        response = answer_call(request);
    }
    response.close = !request.keeps_connection();
    return response;
}

HttpResponse Endpoint::answer_call(const HttpRequest &request) const {
    std::optional<CimHeaders> headers;
    try {
        headers.emplace(request);
        headers->check_call();
        const Request message = read_request(request.body);
        headers->check_match(message);
        HttpResponse response;
        response.fields = {{"Content-Type", "application/xml; charset=\"utf-8\""},
                           {"Cache-Control", "no-cache"}};
        response.body = run(request, message);
        headers->add_operation(response);
        return response;
    } catch (const MessageError &error) {
        HttpResponse response = with_text(error.status(), error.what());
        if (headers) {
            headers->add_error(response, error.cim_error());
        }
        return response;
    }
}

std::string Endpoint::run(const HttpRequest &request, const Request &message) const {
    XmlWriter content;
    const Call call{broker_, message, host_name(request),
                    credentials_ ? credentials_->user : "root", content};
    try {
        if (message.intrinsic) {
            run_intrinsic(call);
        } else {
            run_method(call);
        }
        return write_response(message, content.text());
    } catch (const CimError &error) {
        return write_error(message, error);
    }
}

}  // namespace velkhost::cimxml

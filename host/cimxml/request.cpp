#include "host/cimxml/request.h"

#include "host/cimxml/errors.h"
#include "host/cimxml/value_reader.h"

#include <array>
#include <utility>

namespace velkhost::cimxml {
namespace {

constexpr int kNotImplemented = 501;

XmlElement read_body(std::string_view body) {
    try {
        return read_xml(body);
    } catch (const XmlError &error) {
        throw MessageError(400, "request-not-well-formed", error.what());
    }
}

// DSP0200, 6.3: of each version the major number counts.
void check_version(const XmlElement &element, std::string_view attribute, char major,
                   const char *cim_error) {
    const std::string &version = required_attribute(element, attribute);
    if (version.size() < 3 || version[0] != major || version[1] != '.') {
        throw MessageError(kNotImplemented, cim_error,
                           std::string(attribute) + " " + version + " is not spoken here");
    }
}

XmlElement take_only_child(XmlElement &element) {
    static_cast<void>(only_child(element));
    return std::move(element.children.front());
}

void check_root(const XmlElement &root) {
    if (root.name != "CIM") {
        fail_not_valid("the root element is " + root.name + " instead of CIM");
    }
    check_version(root, "CIMVERSION", '2', "unsupported-cim-version");
    check_version(root, "DTDVERSION", '2', "unsupported-dtd-version");
}

// SIMPLEREQ is the one form of message that is answered.
void check_form(const XmlElement &form) {
    if (form.name == "MULTIREQ") {
        throw MessageError(kNotImplemented, "multiple-requests-unsupported",
                           "several operations in one message are not supported");
    }
    if (form.name != "SIMPLEREQ") {
        fail_not_valid("a SIMPLEREQ was expected, not " + form.name);
    }
}

std::string object_of_method(const XmlElement &path) {
    constexpr std::array kPaths = {std::pair("LOCALCLASSPATH", "NAME"),
                                   std::pair("LOCALINSTANCEPATH", "CLASSNAME")};
    for (const auto &[name, attribute] : kPaths) {
        if (path.name == name && path.children.size() == 2) {
            return read_namespace(path.children.front()) + ':' +
                   required_attribute(path.children.back(), attribute);
        }
    }
    fail_not_valid(path.name + " is no path of the local host");
}

}  // namespace

Request read_request(std::string_view body) {
    XmlElement root = read_body(body);
    check_root(root);
    XmlElement message = take_only_child(root);
    if (message.name != "MESSAGE") {
        fail_not_valid("a MESSAGE was expected, not " + message.name);
    }
    check_version(message, "PROTOCOLVERSION", '1', "unsupported-protocol-version");
    XmlElement form = take_only_child(message);
    check_form(form);

    Request request;
    request.message_id = required_attribute(message, "ID");
    request.call = take_only_child(form);
    request.intrinsic = request.call.name == "IMETHODCALL";
    if (!request.intrinsic && request.call.name != "METHODCALL") {
        fail_not_valid("a method call was expected, not " + request.call.name);
    }
    request.method = required_attribute(request.call, "NAME");
    if (request.call.children.empty()) {
        fail_not_valid(request.call.name + " does not say what it is for");
    }
    const XmlElement &place = request.call.children.front();
    request.object = request.intrinsic ? read_namespace(place) : object_of_method(place);
    return request;
}

}  // namespace velkhost::cimxml

#include "bench/messages.h"

#include <fmt/format.h>

#include <cstdint>
#include <string_view>

namespace velkbench {
namespace {

std::string base64(std::string_view text) {
    constexpr std::string_view kAlphabet =
        "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
    std::string code;
    for (std::size_t i = 0; i < text.size(); i += 3) {
        std::uint32_t bits = 0;
        for (std::size_t j = 0; j < 3; ++j) {
            const bool there = i + j < text.size();
            bits = (bits << 8U) | (there ? static_cast<unsigned char>(text[i + j]) : 0U);
        }
        for (unsigned j = 0; j < 4; ++j) {
            const bool there = i + j <= text.size();
            code += there ? kAlphabet[(bits >> (18U - 6U * j)) & 63U] : '=';
        }
    }
    return code;
}

std::string namespace_path(const Options &options) {
    std::string path = "<LOCALNAMESPACEPATH>";
    std::string_view rest = options.name_space;
    while (!rest.empty()) {
        const std::size_t end = std::min(rest.find('/'), rest.size());
        path += fmt::format("<NAMESPACE NAME=\"{}\"/>", rest.substr(0, end));
        rest.remove_prefix(std::min(end + 1, rest.size()));
    }
    return path + "</LOCALNAMESPACEPATH>";
}

std::string in_http(const Options &options, std::string_view method, std::string_view object,
                    std::string_view call) {
    const std::string body = fmt::format(
        R"(<?xml version="1.0" encoding="utf-8"?><CIM CIMVERSION="2.0" DTDVERSION="2.0">)"
        R"(<MESSAGE ID="1" PROTOCOLVERSION="1.0"><SIMPLEREQ>{}</SIMPLEREQ></MESSAGE></CIM>)",
        call);
    const std::string authorization =
        options.url.credentials.empty()
            ? ""
            : "Authorization: Basic " + base64(options.url.credentials) + "\r\n";
    return fmt::format(
        "POST {} HTTP/1.1\r\nHost: {}:{}\r\n{}Content-Type: application/xml; charset=\"utf-8\"\r\n"
        "CIMOperation: MethodCall\r\nCIMMethod: {}\r\nCIMObject: {}\r\nContent-Length: {}\r\n{}\r\n"
        "{}",
        options.url.path, options.url.host, options.url.port, authorization, method, object,
        body.size(), options.new_connections ? "Connection: close\r\n" : "", body);
}

Message intrinsic(const Options &options, const char *method, const std::string &parameter) {
    return {method, in_http(options, method, options.name_space,
                            fmt::format("<IMETHODCALL NAME=\"{}\">{}{}</IMETHODCALL>", method,
                                        namespace_path(options), parameter))};
}

std::string class_parameter(const Options &options) {
    return fmt::format(R"(<IPARAMVALUE NAME="ClassName"><CLASSNAME NAME="{}"/></IPARAMVALUE>)",
                       options.class_name);
}

}  // namespace

std::string enumerate_instance_names(const Options &options) {
    return intrinsic(options, "EnumerateInstanceNames", class_parameter(options)).bytes;
}

std::vector<Message> load_messages(const Options &options, const std::string &instance_name) {
    const std::string call = fmt::format(
        "<METHODCALL NAME=\"{}\"><LOCALINSTANCEPATH>{}{}</LOCALINSTANCEPATH></METHODCALL>",
        options.method, namespace_path(options), instance_name);
    const std::string object = options.name_space + ':' + options.class_name;
    return {
        intrinsic(options, "EnumerateInstances", class_parameter(options)),
        intrinsic(options, "GetInstance",
                  "<IPARAMVALUE NAME=\"InstanceName\">" + instance_name + "</IPARAMVALUE>"),
        {"method " + options.method, in_http(options, options.method, object, call)},
    };
}

}  // namespace velkbench

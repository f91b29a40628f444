#include "host/cimxml/response.h"

#include "host/cimxml/xml_writer.h"

namespace velkhost::cimxml {

std::string write_response(const Request &request, std::string_view content) {
    XmlWriter out;
    out.raw("<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n");
    {
        const XmlWriter::Scope cim(out, "CIM", {{"CIMVERSION", "2.0"}, {"DTDVERSION", "2.0"}});
        const XmlWriter::Scope message(out, "MESSAGE",
                                       {{"ID", request.message_id}, {"PROTOCOLVERSION", "1.0"}});
        const XmlWriter::Scope form(out, "SIMPLERSP");
        const XmlWriter::Scope response(out,
                                        request.intrinsic ? "IMETHODRESPONSE" : "METHODRESPONSE",
                                        {{"NAME", request.method}});
        out.raw(content);
    }
    return out.take();
}

std::string write_error(const Request &request, const CimError &error) {
    XmlWriter out;
    const std::string code = std::to_string(error.code());
    out.empty("ERROR", {{"CODE", code}, {"DESCRIPTION", error.what()}});
    return write_response(request, out.text());
}

}  // namespace velkhost::cimxml

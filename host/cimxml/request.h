// One request of CIM-XML: the envelope around an operation (DSP0201, 5.2.5).
#pragma once

#include "host/cimxml/xml.h"

#include <string>
#include <string_view>

namespace velkhost::cimxml {

struct Request {
    std::string message_id;
    bool intrinsic = false;
    std::string method;
    // Of an intrinsic method the namespace, "root/cimv2"; of another "root/cimv2:Class".
    std::string object;
    XmlElement call;  // IMETHODCALL or METHODCALL
};

// Throws MessageError: 400 for what is no request, 501 for versions and forms of request that are
// not spoken here.
Request read_request(std::string_view body);

}  // namespace velkhost::cimxml

// The envelope of a response (DSP0201, 5.2.5).
#pragma once

#include "host/cimxml/errors.h"
#include "host/cimxml/request.h"

#include <string>
#include <string_view>

namespace velkhost::cimxml {

// A message with `content` in the response element of the request's method.
std::string write_response(const Request &request, std::string_view content);

// A message with an ERROR.
std::string write_error(const Request &request, const CimError &error);

}  // namespace velkhost::cimxml

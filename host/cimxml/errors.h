// The two ways in which a request fails: with a CIM error inside of an answer, or as a whole.
#pragma once

#include "host/broker/status.h"

#include <stdexcept>
#include <string>
#include <utility>

namespace velkhost::cimxml {

// The operation failed: HTTP status 200, an ERROR element (DSP0201, 5.2.6.1). what() is its text.
class CimError : public std::runtime_error {
  public:
    CimError(CMPIrc code, const std::string &description)
        : std::runtime_error(description), code_(code) {}

    [[nodiscard]] CMPIrc code() const { return code_; }

  private:
    CMPIrc code_;
};

// The message is none that can be answered by CIM-XML. what() is for people.
class MessageError : public std::runtime_error {
  public:
    // `cim_error` is the value of the header CIMError (DSP0200, 6.3.13); empty: there is none.
    MessageError(int status, std::string cim_error, const std::string &why)
        : std::runtime_error(why), status_(status), cim_error_(std::move(cim_error)) {}

    [[nodiscard]] int status() const { return status_; }
    [[nodiscard]] const std::string &cim_error() const { return cim_error_; }

  private:
    int status_;
    std::string cim_error_;
};

// What a code of DSP0200 (6.6) means, for errors that come without a text; an unknown code has the
// text of CIM_ERR_FAILED.
const char *cim_error_text(int code);

// Throws CimError for a status that is an error. Codes that only CMPI knows become 1.
void check(const broker::Status &status);

}  // namespace velkhost::cimxml

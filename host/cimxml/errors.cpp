#include "host/cimxml/errors.h"

#include <array>

namespace velkhost::cimxml {
namespace {

// By code.
constexpr std::array kTexts = {
    "",
    "The operation failed",
    "Access is denied",
    "Invalid namespace",
    "A parameter is invalid",
    "Class not found",
    "The requested object could not be found",
    "The requested operation is not supported",
    "The class has subclasses",
    "The class has instances",
    "Superclass not found",
    "The object exists already",
    "Property not found",
    "The value is of another type",
    "The query language is not supported",
    "The query is invalid",
    "The method is not available",
    "Method not found",
};

bool is_known(int code) {
    return code > 0 && static_cast<std::size_t>(code) < kTexts.size();
}

}  // namespace

const char *cim_error_text(int code) {
    return kTexts.at(static_cast<std::size_t>(is_known(code) ? code : 1));
}

void check(const broker::Status &status) {
    if (status.ok()) {
        return;
    }
    const CMPIrc code = is_known(status.code) ? status.code : CMPI_RC_ERR_FAILED;
    std::string text = status.message.empty() ? cim_error_text(code) : status.message;
    if (code != status.code) {
        text += " (" + std::to_string(status.code) + ")";
    }
    throw CimError(code, text);
}

}  // namespace velkhost::cimxml

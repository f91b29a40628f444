#include "host/cimxml/errors.h"

#include <array>

namespace velkhost::cimxml {
namespace {

constexpr std::array kNames = {
    "",
    "CIM_ERR_FAILED",
    "CIM_ERR_ACCESS_DENIED",
    "CIM_ERR_INVALID_NAMESPACE",
    "CIM_ERR_INVALID_PARAMETER",
    "CIM_ERR_INVALID_CLASS",
    "CIM_ERR_NOT_FOUND",
    "CIM_ERR_NOT_SUPPORTED",
    "CIM_ERR_CLASS_HAS_CHILDREN",
    "CIM_ERR_CLASS_HAS_INSTANCES",
    "CIM_ERR_INVALID_SUPERCLASS",
    "CIM_ERR_ALREADY_EXISTS",
    "CIM_ERR_NO_SUCH_PROPERTY",
    "CIM_ERR_TYPE_MISMATCH",
    "CIM_ERR_QUERY_LANGUAGE_NOT_SUPPORTED",
    "CIM_ERR_INVALID_QUERY",
    "CIM_ERR_METHOD_NOT_AVAILABLE",
    "CIM_ERR_METHOD_NOT_FOUND",
};

bool is_known(int code) {
    return code > 0 && static_cast<std::size_t>(code) < kNames.size();
}

}  // namespace

const char *cim_error_name(int code) {
    return kNames.at(static_cast<std::size_t>(is_known(code) ? code : 1));
}

void check(const broker::Status &status) {
    if (status.ok()) {
        return;
    }
    const CMPIrc code = is_known(status.code) ? status.code : CMPI_RC_ERR_FAILED;
    std::string text = status.message.empty() ? cim_error_name(code) : status.message;
    if (code != status.code) {
        text += " (" + std::to_string(status.code) + ")";
    }
    throw CimError(code, text);
}

}  // namespace velkhost::cimxml

// CMPIString: its `hdl` is the text itself, which a provider may change in place.
#include "host/broker/convert.h"

namespace velkhost::broker {
namespace {

CMPIString *clone_string(const CMPIString *string, CMPIStatus *status) {
    auto *object = open(string, "clone", status);
    if (object == nullptr) {
        return nullptr;
    }
    const auto *text = static_cast<const char *>(object->hdl);
    return make<CMPIString>(object->tag.core, Custody::kClone,
                            {"clone", object->tag.origin.subject},
                            text != nullptr ? StringPayload(text) : std::nullopt);
}

const char *get_char_ptr(const CMPIString *string, CMPIStatus *status) {
    const auto *object = open(string, "getCharPtr", status);
    return object != nullptr ? static_cast<const char *>(object->hdl) : nullptr;
}

}  // namespace

const CMPIStringFT kStringTable{
    .ftVersion = 1,
    .release = release<CMPIString>,
    .clone = clone_string,
    .getCharPtr = get_char_ptr,
};

}  // namespace velkhost::broker

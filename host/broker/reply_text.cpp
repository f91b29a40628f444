#include "host/broker/reply_text.h"

namespace velkhost::broker {

std::string result_text(const ObjectsReply &reply) {
    return reply.objects.empty() ? "" : to_text(cim::Value::array(CMPI_ref, reply.objects));
}

std::string result_text(const MethodReply &reply) {
    std::string text = reply.return_value ? to_text(*reply.return_value) : "";
    for (const cim::NamedValue &item : reply.out) {
        text += (text.empty() ? "" : ", ") + item.name + '=' + to_text(item.value);
    }
    return text;
}

}  // namespace velkhost::broker

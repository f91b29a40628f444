// The payload configuration file of a package, as tests write it.
#pragma once

#include <optional>
#include <string>
#include <vector>

namespace velktest {

inline constexpr const char *kPayloadConfig = "/var/tmp/ZEB/Pakro/Package/image/payload.xml";

struct ConfigPayload {
    std::string file;
    std::vector<std::string> dfns;  // of the adapters that it applies to
    std::optional<int> order;
};

inline std::string payload_config(const std::vector<ConfigPayload> &payloads) {
    std::string text = "<updateConfiguration>\n";
    for (const ConfigPayload &payload : payloads) {
        const std::string order =
            payload.order ? " order=\"" + std::to_string(*payload.order) + "\"" : "";
        text += "<payload" + order + ">" + payload.file + "</payload>\n";
        for (const std::string &dfn : payload.dfns) {
            text += "<applicability type=\"DFN\">" + dfn + "</applicability>\n";
        }
        text += "</payload>\n";
    }
    return text + "</updateConfiguration>\n";
}

}  // namespace velktest

// Requests to the adapters' vendors: their installation services and what they show of adapters.
#pragma once

#include "providers_fixture.h"

#include <string>
#include <vector>

namespace velkhost::providers::testing {

class AdapterProvider : public ProviderTest {
  protected:
    static cim::ObjectPath class_path(const std::string &name_space, const std::string &name) {
        return {"", name_space, name, {}};
    }

    // The texts of a property of all instances of a class, in their order.
    std::vector<std::string> texts(const cim::ObjectPath &path, const char *property) {
        const broker::InstancesReply reply = broker_.enumerate_instances(path);
        EXPECT_TRUE(reply.status.ok()) << reply.status.message;
        return texts_of(reply, property);
    }

    static std::vector<std::string> texts_of(const broker::InstancesReply &reply,
                                             const char *property) {
        std::vector<std::string> out;
        for (const cim::Instance &instance : reply.instances) {
            out.push_back(text(instance.properties, property));
        }
        return out;
    }

    // The path of the class's instance number `index`.
    cim::ObjectPath path_at(const cim::ObjectPath &path, std::size_t index = 0) {
        const broker::PathsReply reply = broker_.enumerate_instance_names(path);
        EXPECT_TRUE(reply.status.ok()) << reply.status.message;
        return index < reply.paths.size() ? reply.paths[index] : cim::ObjectPath{};
    }

    broker::InstancesReply associated(const cim::ObjectPath &from, const std::string &association,
                                      const std::string &result_class) {
        broker::AssociationFilter filter;
        filter.association_class = association;
        filter.result_class = result_class;
        return broker_.associators(from, filter);
    }

    // An unpacked package with one payload for `dfn`; the folder's path. `file` is made unless it
    // is empty.
    std::string unpack(const std::string &dfn, const std::string &file = "fw.bin") {
        namespace fs = std::filesystem;
        fs::create_directories(folder_ / "package/image");
        std::ofstream(folder_ / "package/image/payload.xml")
            << "<updateConfiguration>\n<payload order=\"1\">image/fw.bin</payload>\n"
               "<applicability type=\"DFN\">"
            << dfn << "</applicability>\n</payload>\n</updateConfiguration>\n";
        if (!file.empty()) {
            std::ofstream(folder_ / "package/image" / file) << "image";
        }
        return (folder_ / "package/").string();
    }
};

}  // namespace velkhost::providers::testing

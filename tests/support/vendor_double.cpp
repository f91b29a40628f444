#include "tests/support/vendor_double.h"

#include <cmpi/cmpimacs.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <utility>

namespace velktest {
namespace {

constexpr CMPIStatus kDone = {CMPI_RC_OK, nullptr};

// The front of the list, which stays if it is the last one.
template <class Item>
Item take(std::deque<Item> &list) {
    Item item = list.front();
    if (list.size() > 1) {
        list.pop_front();
    }
    return item;
}

// Values as they go through the broker's tables.
class Sender {
  public:
    explicit Sender(const CMPIBroker *broker) : broker_(broker) {}

    // Hands `value` to `sink(const CMPIValue *, CMPIType)`.
    template <class Sink>
    void send(const Value &value, Sink sink) const {
        CMPIValue out{};
        if (const auto text = value.as_text()) {
            sink(chars(*text), CMPI_chars);
        } else if (const auto *path = value.as_path()) {
            out.ref = make_path(*path);
            sink(&out, CMPI_ref);
        } else if (const auto *elements = value.as_array()) {
            out.array = make_array(*elements);
            sink(&out, CMPI_stringA);
        } else if (const auto number = value.as_unsigned()) {
            out.uint64 = *number;  // little-endian: so are the narrower ones
            sink(&out, value.type());
        } else {
            sink(nullptr, value.type());
        }
    }

    [[nodiscard]] CMPIObjectPath *make_path(const velkhost::cim::ObjectPath &path) const {
        CMPIObjectPath *out =
            CMNewObjectPath(broker_, path.name_space.c_str(), path.class_name.c_str(), nullptr);
        for (const auto &key : path.keys) {
            send(key.value, [&](const CMPIValue *value, CMPIType type) {
                CMAddKey(out, key.name.c_str(), value, type);
            });
        }
        return out;
    }

  private:
    static const CMPIValue *chars(std::string_view text) {
        return reinterpret_cast<const CMPIValue *>(text.data());
    }

    [[nodiscard]] CMPIArray *make_array(const Value::Array &elements) const {
        const auto count = static_cast<CMPICount>(elements.size());
        CMPIArray *out = CMNewArray(broker_, count, CMPI_string, nullptr);
        for (CMPICount i = 0; i < count; ++i) {
            send(elements[i], [&](const CMPIValue *value, CMPIType) {
                CMSetArrayElementAt(out, i, value, value == nullptr ? CMPI_string : CMPI_chars);
            });
        }
        return out;
    }

    const CMPIBroker *broker_;
};

bool has_key_text(const CMPIObjectPath *path, const std::string &text) {
    for (CMPICount i = 0; i < CMGetKeyCount(path, nullptr); ++i) {
        const CMPIData key = CMGetKeyAt(path, i, nullptr, nullptr);
        const bool is_text = key.type == CMPI_string && key.value.string != nullptr;
        if (is_text && text == CMGetCharsPtr(key.value.string, nullptr)) {
            return true;
        }
    }
    return false;
}

template <class Mi>
CMPIStatus clean_up(Mi *, const CMPIContext *, CMPIBoolean) {
    return kDone;
}

}  // namespace

// The function tables. What the library never asks for stays empty: a call of it would be seen.
struct VendorTables {
    static VendorClass &of(const void *hdl) {
        return *static_cast<VendorClass *>(const_cast<void *>(hdl));
    }

    static CMPIStatus enumerate(CMPIInstanceMI *mi, const CMPIContext *, const CMPIResult *result,
                                const CMPIObjectPath *, const char **properties) {
        EXPECT_EQ(properties, nullptr);
        return of(mi->hdl).enumerate(result);
    }
    static CMPIStatus read(CMPIInstanceMI *mi, const CMPIContext *, const CMPIResult *result,
                           const CMPIObjectPath *, const char **) {
        return of(mi->hdl).read(result);
    }
    static CMPIStatus traverse(CMPIAssociationMI *mi, const CMPIContext *, const CMPIResult *result,
                               const CMPIObjectPath *source, const char *, const char *result_class,
                               const char *role, const char *result_role, const char **properties) {
        EXPECT_EQ(role, nullptr);
        EXPECT_EQ(result_role, nullptr);
        EXPECT_EQ(properties, nullptr);
        return of(mi->hdl).traverse(result, source, result_class);
    }
    static CMPIStatus invoke(CMPIMethodMI *mi, const CMPIContext *, const CMPIResult *result,
                             const CMPIObjectPath *path, const char *method, const CMPIArgs *,
                             CMPIArgs *out) {
        return of(mi->hdl).invoke(result, path, method, out);
    }

    static CMPIInstanceMIFT *instances() {
        static CMPIInstanceMIFT table{};
        table.cleanup = &clean_up<CMPIInstanceMI>;
        table.enumerateInstances = &enumerate;
        table.getInstance = &read;
        return &table;
    }
    static CMPIAssociationMIFT *associations() {
        static CMPIAssociationMIFT table{};
        table.cleanup = &clean_up<CMPIAssociationMI>;
        table.associators = &traverse;
        return &table;
    }
    static CMPIMethodMIFT *methods() {
        static CMPIMethodMIFT table{};
        table.cleanup = &clean_up<CMPIMethodMI>;
        table.invokeMethod = &invoke;
        return &table;
    }
};

VendorClass::VendorClass(std::string name_space, std::string name)
    : name_space_(std::move(name_space)),
      name_(std::move(name)),
      instance_mi_{this, VendorTables::instances()},
      association_mi_{this, VendorTables::associations()},
      method_mi_{this, VendorTables::methods()} {}

velkhost::broker::ManagementInterfaces VendorClass::interfaces(const CMPIBroker *broker) {
    broker_ = broker;
    velkhost::broker::ManagementInterfaces interfaces;
    interfaces.instance = &instance_mi_;
    interfaces.association = &association_mi_;
    interfaces.method = &method_mi_;
    return interfaces;
}

CMPIInstance *VendorClass::make(const std::string &class_name,
                                const VendorInstance &instance) const {
    const Sender sender(broker_);
    CMPIObjectPath *path = sender.make_path({"", name_space_, class_name, instance.keys});
    CMPIInstance *out = CMNewInstance(broker_, path, nullptr);
    for (const auto &property : instance.properties) {
        sender.send(property.value, [&](const CMPIValue *value, CMPIType type) {
            CMSetProperty(out, property.name.c_str(), value, type);
        });
    }
    return out;
}

CMPIStatus VendorClass::enumerate(const CMPIResult *result) {
    const auto found = enumerations.empty() ? std::optional(instances) : take(enumerations);
    if (!found) {
        return {CMPI_RC_ERR_FAILED, nullptr};
    }
    for (const VendorInstance &instance : *found) {
        CMReturnInstance(result, make(name_, instance));
    }
    CMReturnDone(result);
    return kDone;
}

CMPIStatus VendorClass::read(const CMPIResult *result) {
    if (looks.empty()) {
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    }
    CMReturnInstance(result, make(name_, {{}, take(looks)}));
    CMReturnDone(result);
    return kDone;
}

CMPIStatus VendorClass::traverse(const CMPIResult *result, const CMPIObjectPath *source,
                                 const char *result_class) const {
    for (const auto &[key, targets_of] : linked) {
        if (!has_key_text(source, key)) {
            continue;
        }
        if (!targets_of) {
            return {CMPI_RC_ERR_FAILED, nullptr};
        }
        for (const VendorInstance &instance : *targets_of) {
            CMReturnInstance(result, make(result_class, instance));
        }
    }
    CMReturnDone(result);
    return kDone;
}

CMPIStatus VendorClass::invoke(const CMPIResult *result, const CMPIObjectPath *path,
                               const std::string &method, CMPIArgs *out) {
    const CMPIString *target = broker_->eft->toString(broker_, path, nullptr);
    targets.emplace_back(CMGetCharsPtr(target, nullptr));
    if (on_call) {
        on_call();
    }
    if (seconds > 0) {
        sleep(seconds);
    }
    const auto known = answers.find(method);
    if (known == answers.end()) {
        return {CMPI_RC_ERR_METHOD_NOT_FOUND, nullptr};
    }
    const VendorAnswer answer = take(known->second);
    if (answer.code != CMPI_RC_OK) {
        return {answer.code, CMNewString(broker_, answer.message.c_str(), nullptr)};
    }
    const Sender sender(broker_);
    for (const auto &output : answer.outputs) {
        sender.send(output.value, [&](const CMPIValue *value, CMPIType type) {
            CMAddArg(out, output.name.c_str(), value, type);
        });
    }
    CMPIValue value{};
    value.uint32 = answer.value;
    CMReturnData(result, &value, CMPI_uint32);
    CMReturnDone(result);
    return kDone;
}

Value texts(const std::vector<std::string> &values) {
    Value::Array elements;
    std::ranges::transform(values, std::back_inserter(elements), text);
    return Value::array(CMPI_string, std::move(elements));
}

}  // namespace velktest

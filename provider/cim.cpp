#include "velk/cim.h"

#include "velk/debug_log.h"

namespace velk::cim {
namespace {

const CMPIBroker *broker() {
    return ZEB_VMWarePackageInstallationBroker;
}

constexpr CMPIData kNothing = {CMPI_null, CMPI_nullValue, {}};

// For `chars` the text itself is passed where other types pass a pointer to the value.
CMPIValue *chars(const char *text) {
    return reinterpret_cast<CMPIValue *>(const_cast<char *>(text));
}

}  // namespace

Path make_path(const char *name_space, const char *class_name) {
    return Path(CMNewObjectPath(broker(), name_space, class_name, nullptr));
}

Args make_args() {
    return Args(CMNewArgs(broker(), nullptr));
}

Instance make_instance(const Path &path) {
    return Instance(path ? CMNewInstance(broker(), path.get(), nullptr) : nullptr);
}

void add_key(const Path &path, const char *name, const char *text) {
    if (path) {
        CMAddKey(path.get(), name, chars(text), CMPI_chars);
    }
}

void add_text(const Args &args, const char *name, const char *text) {
    if (args) {
        CMAddArg(args.get(), name, chars(text), CMPI_chars);
    }
}

void add_uint8(const Args &args, const char *name, std::uint8_t value) {
    CMPIValue holder = {};
    holder.uint8 = value;
    if (args) {
        CMAddArg(args.get(), name, &holder, CMPI_uint8);
    }
}

void add_uint16(const Args &args, const char *name, std::uint16_t value) {
    CMPIValue holder = {};
    holder.uint16 = value;
    if (args) {
        CMAddArg(args.get(), name, &holder, CMPI_uint16);
    }
}

void add_reference(CMPIArgs *args, const char *name, const CMPIObjectPath *path) {
    CMPIValue holder = {};
    holder.ref = const_cast<CMPIObjectPath *>(path);
    if (args != nullptr && path != nullptr) {
        CMAddArg(args, name, &holder, CMPI_ref);
    }
}

Array make_uint16_array(unsigned count) {
    return Array(CMNewArray(broker(), count, CMPI_uint16, nullptr));
}

void set_element(const Array &array, unsigned index, std::uint16_t value) {
    CMPIValue holder = {};
    holder.uint16 = value;
    if (array) {
        CMSetArrayElementAt(array.get(), index, &holder, CMPI_uint16);
    }
}

void add_uint16_array(const Args &args, const char *name, const Array &array) {
    CMPIValue holder = {};
    holder.array = array.get();
    if (args && array) {
        CMAddArg(args.get(), name, &holder, CMPI_uint16A);
    }
}

void set_text(const Instance &instance, const char *name, const char *text) {
    if (instance) {
        CMSetProperty(instance.get(), name, chars(text), CMPI_chars);
    }
}

Path clone_reference(const CMPIData &data) {
    if (data.type != CMPI_ref || data.value.ref == nullptr) {
        return nullptr;
    }
    return Path(CMClone(data.value.ref, nullptr));
}

bool is_present(const CMPIStatus &status, const CMPIData &data) {
    constexpr int kUnusable = CMPI_nullValue | CMPI_notFound | CMPI_badValue;
    return status.rc == CMPI_RC_OK && (data.state & kUnusable) == 0;
}

const char *text_of(const CMPIString *string) {
    return string == nullptr ? nullptr : CMGetCharsPtr(string, nullptr);
}

const char *text_of(const CMPIData &data) {
    switch (data.type) {
        case CMPI_string:
            return text_of(data.value.string);
        case CMPI_chars:
            return data.value.chars;
        default:
            return nullptr;
    }
}

int int_of(const CMPIData &data, int otherwise) {
    switch (data.type) {
        case CMPI_uint8:
            return data.value.uint8;
        case CMPI_uint16:
            return data.value.uint16;
        case CMPI_uint32:
            return static_cast<int>(data.value.uint32);
        case CMPI_uint64:
            return static_cast<int>(data.value.uint64);
        case CMPI_sint8:
            return data.value.sint8;
        case CMPI_sint16:
            return data.value.sint16;
        case CMPI_sint32:
            return data.value.sint32;
        case CMPI_sint64:
            return static_cast<int>(data.value.sint64);
        default:
            return otherwise;
    }
}

const char *message_of(const CMPIStatus &status) {
    const char *text = text_of(status.msg);
    return text == nullptr ? "" : text;
}

CMPIData argument(const CMPIArgs *args, const char *name) {
    if (args == nullptr) {
        return kNothing;
    }
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = CMGetArg(args, name, &status);
    return is_present(status, data) ? data : kNothing;
}

CMPIData property(const CMPIInstance *instance, const char *name) {
    if (instance == nullptr) {
        return kNothing;
    }
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = CMGetProperty(instance, name, &status);
    return is_present(status, data) ? data : kNothing;
}

CMPIData element(const CMPIData &array, unsigned index) {
    if ((array.type & CMPI_ARRAY) == 0 || array.value.array == nullptr ||
        index >= CMGetArrayCount(array.value.array, nullptr)) {
        return kNothing;
    }
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = CMGetArrayElementAt(array.value.array, index, &status);
    return is_present(status, data) ? data : kNothing;
}

const CMPIObjectPath *path_of(const CMPIInstance *instance) {
    return instance == nullptr ? nullptr : CMGetObjectPath(instance, nullptr);
}

const char *key_of(const CMPIInstance *instance, const char *name) {
    const CMPIObjectPath *path = path_of(instance);
    if (path == nullptr) {
        return nullptr;
    }
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data = CMGetKey(path, name, &status);
    return is_present(status, data) ? text_of(data) : nullptr;
}

Call invoke(const CMPIContext *context, const Path &path, const char *method, const Args &in,
            const Args &out) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData data =
        CBInvokeMethod(broker(), context, path.get(), method, in.get(), out.get(), &status);
    const bool returned = is_present(status, data) && data.type != CMPI_null;
    return {status, returned ? int_of(data) : 0, returned};
}

Instance get_instance(const CMPIContext *context, const Path &path) {
    if (!path) {
        return nullptr;
    }
    return Instance(CBGetInstance(broker(), context, path.get(), nullptr, nullptr));
}

Instances::Instances(CMPIEnumeration *enumeration, const CMPIStatus &status)
    : enumeration_(enumeration) {
    if (status.rc != CMPI_RC_OK) {
        enumeration_.reset();
    }
}

Instances Instances::of(const CMPIContext *context, const Path &path) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIEnumeration *found =
        path ? CBEnumInstances(broker(), context, path.get(), nullptr, &status) : nullptr;
    return {found, status};
}

Instances Instances::associated(const CMPIContext *context, const CMPIObjectPath *source,
                                const char *association, const char *result_class) {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    CMPIEnumeration *found = source == nullptr
                                 ? nullptr
                                 : CBAssociators(broker(), context, source, association,
                                                 result_class, nullptr, nullptr, nullptr, &status);
    return {found, status};
}

void Instances::Iterator::advance() {
    current_ = nullptr;
    if (source_ == nullptr || CMHasNext(source_, nullptr) == 0) {
        return;
    }
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    const CMPIData next = CMGetNext(source_, &status);
    if (is_present(status, next) && next.type == CMPI_instance) {
        current_ = next.value.inst;
    }
}

}  // namespace velk::cim

// A thin layer over the broker's function tables, so that callers read as what they ask. Every
// reader takes null objects and absent items for "nothing there". Objects that the library makes
// or is given by the broker are released by the thread that got them: the install thread is not a
// request thread, and what it leaves behind piles up until it ends.
#pragma once

#include <cmpi/cmpidt.h>
#include <cmpi/cmpift.h>
#include <cmpi/cmpimacs.h>

#include <cstddef>
#include <cstdint>
#include <memory>

#include "velk/api.h"

// The broker, as the factory that ran last was given it.
VELK_API const CMPIBroker *ZEB_VMWarePackageInstallationBroker;

namespace velk::cim {

struct Release {
    template <class Object>
    void operator()(Object *object) const {
        object->ft->release(object);
    }
};

template <class Object>
using Owned = std::unique_ptr<Object, Release>;

using Path = Owned<CMPIObjectPath>;
using Args = Owned<CMPIArgs>;
using Instance = Owned<CMPIInstance>;
using Array = Owned<CMPIArray>;

// ---- Making ----

// Null when the broker cannot make it.
Path make_path(const char *name_space, const char *class_name);
Args make_args();
Instance make_instance(const Path &path);

// Nothing is added to a null path, list or instance. A null `text` is left to the broker.
void add_key(const Path &path, const char *name, const char *text);
void add_text(const Args &args, const char *name, const char *text);
void add_uint8(const Args &args, const char *name, std::uint8_t value);
void add_uint16(const Args &args, const char *name, std::uint16_t value);
void add_reference(CMPIArgs *args, const char *name, const CMPIObjectPath *path);

// An array of null elements; setting an element beyond its size is left to the broker.
Array make_uint16_array(unsigned count);
void set_element(const Array &array, unsigned index, std::uint16_t value);
void add_uint16_array(const Args &args, const char *name, const Array &array);

void set_text(const Instance &instance, const char *name, const char *text);

// A copy that outlives the data it was taken from; null when `data` holds no reference.
Path clone_reference(const CMPIData &data);

// ---- Reading ----

// A status and value that are usable: no error, and not null, not found or bad.
bool is_present(const CMPIStatus &status, const CMPIData &data);

// The text of a string, null when there is none; it lives as long as its owner.
const char *text_of(const CMPIString *string);
const char *text_of(const CMPIData &data);

// The number in `data` when it is an integer of any width, else `otherwise`.
int int_of(const CMPIData &data, int otherwise = 0);

// The message of a status, empty when it has none.
const char *message_of(const CMPIStatus &status);

// The item of that name; its type is CMPI_null when it is absent or null.
CMPIData argument(const CMPIArgs *args, const char *name);
CMPIData property(const CMPIInstance *instance, const char *name);

// Element `index` of an array property; null type when the property or the element is absent.
CMPIData element(const CMPIData &array, unsigned index);

// The path of an instance, which belongs to the broker, and the text of one of its keys.
const CMPIObjectPath *path_of(const CMPIInstance *instance);
const char *key_of(const CMPIInstance *instance, const char *name);

// ---- Asking other providers ----

struct Call {
    CMPIStatus status;
    int value;      // the method's return value, 0 when it gave none
    bool returned;  // whether it gave one
};

Call invoke(const CMPIContext *context, const Path &path, const char *method, const Args &in,
            const Args &out);

// Null when it cannot be had; all properties.
Instance get_instance(const CMPIContext *context, const Path &path);

// The instances that an enumeration or an association traversal yields, for a range-based `for`. It
// ends at the first element that is no instance. Elements live as long as the range.
class Instances {
  public:
    // All instances of the class that `path` names.
    static Instances of(const CMPIContext *context, const Path &path);

    // The instances of `result_class` that `association` links to `source`.
    static Instances associated(const CMPIContext *context, const CMPIObjectPath *source,
                                const char *association, const char *result_class);

    class Iterator {
      public:
        explicit Iterator(const CMPIEnumeration *source) : source_(source) { advance(); }
        const CMPIInstance *operator*() const { return current_; }
        Iterator &operator++() {
            advance();
            return *this;
        }
        bool operator!=(std::nullptr_t) const { return current_ != nullptr; }

      private:
        void advance();

        const CMPIEnumeration *source_;
        const CMPIInstance *current_ = nullptr;
    };

    // Going on where an earlier walk of the same range stopped.
    [[nodiscard]] Iterator begin() const { return Iterator(enumeration_.get()); }
    [[nodiscard]] static std::nullptr_t end() { return nullptr; }

    // Whether the broker gave an enumeration at all.
    [[nodiscard]] bool is_valid() const { return enumeration_ != nullptr; }

  private:
    Instances(CMPIEnumeration *enumeration, const CMPIStatus &status);

    Owned<CMPIEnumeration> enumeration_;
};

}  // namespace velk::cim

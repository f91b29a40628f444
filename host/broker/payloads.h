// What stands behind the face of each encapsulated object.
#pragma once

#include "host/broker/query.h"
#include "host/broker/tag.h"
#include "host/cim/instance.h"
#include "host/cim/names.h"

#include <cmpi/cmpift.h>

#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace velkhost::broker {

// Inner objects of another object; they end with it.
class Parts {
  public:
    Parts() = default;
    ~Parts();
    Parts(Parts &&) = default;
    Parts &operator=(Parts &&) = delete;
    Parts(const Parts &) = delete;
    Parts &operator=(const Parts &) = delete;

    void add(Tag &tag) { tags_.push_back(&tag); }

  private:
    std::vector<Tag *> tags_;
};

// No value: the string object exists, its text is null.
using StringPayload = std::optional<std::string>;

// Elements are held as they were given, so objects in them must outlive a tracked array. What
// `parts` holds belongs to the array: copies of char texts, and all elements of a clone.
struct ArrayPayload {
    CMPIType element_type = CMPI_null;
    bool may_grow = false;
    std::vector<CMPIData> elements;
    Parts parts;
};

struct EnumerationPayload {
    CMPIArray *elements = nullptr;  // a part
    CMPICount next = 0;
    Parts parts;
};

struct InstancePayload {
    cim::Instance instance;
    // When set, setProperty ignores names outside of it.
    std::optional<std::set<std::string, cim::NameLess>> filter;
};

using PathPayload = cim::ObjectPath;
using ArgsPayload = cim::NamedValues;

// Entry names keep their case apart, unlike all other names of CIM.
using ContextPayload = std::vector<cim::NamedValue>;

// 25 characters (DSP0004, 5.2.4).
using DateTimePayload = std::string;

// Where the results of a provider call collect. It outlives the call.
struct ResultSink {
    bool for_method = false;
    std::vector<cim::Value> values;
    bool done = false;
};
using ResultPayload = ResultSink *;

using SelectExpPayload = std::shared_ptr<const query::Query>;

struct SelectCondPayload {
    query::NormalForm form;
    bool disjunctive = true;
};
using SubCondPayload = query::Row;
using PredicatePayload = query::Comparison;

}  // namespace velkhost::broker

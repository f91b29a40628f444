// The operations of DSP0200 on a broker. Each reads its parameters, asks the broker as a client
// does, and writes what stands in its response. They throw CimError and MessageError.
#pragma once

#include "host/broker/broker.h"
#include "host/cimxml/parameters.h"
#include "host/cimxml/request.h"
#include "host/cimxml/value_reader.h"
#include "host/cimxml/xml_writer.h"

#include <string>
#include <string_view>

namespace velkhost::cimxml {

// One operation under way.
struct Call {
    broker::Broker &broker;
    const Request &request;
    std::string host;       // what clients call this host; stands in paths
    std::string principal;  // who asks
    XmlWriter &out;

    // The namespace of an intrinsic method; throws CimError when there is none such.
    [[nodiscard]] const std::string &name_space() const;
    [[nodiscard]] ValueReader reader() const { return {broker.repository(), request.object}; }
    [[nodiscard]] broker::RequestOptions options(CMPIFlags flags = 0) const;
};

// The intrinsic method of the request, with the IRETURNVALUE that it has; CIM_ERR_NOT_SUPPORTED for
// those that are not offered.
void run_intrinsic(const Call &call);

// The extrinsic method of the request: RETURNVALUE and PARAMVALUE elements.
void run_method(const Call &call);

// The class of an operation's parameter; throws CimError when there is none such.
broker::ClassPointer require_class(const Call &call, const std::string &name);

// -- The single operations --

void get_class(const Call &call);
void enumerate_classes(const Call &call);
void enumerate_class_names(const Call &call);
void get_instance(const Call &call);
void enumerate_instances(const Call &call);
void enumerate_instance_names(const Call &call);
void delete_instance(const Call &call);
void associators(const Call &call);
void associator_names(const Call &call);
void references(const Call &call);
void reference_names(const Call &call);

}  // namespace velkhost::cimxml

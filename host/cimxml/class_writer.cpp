#include "host/cimxml/class_writer.h"

#include "host/cim/names.h"
#include "host/cimxml/value_writer.h"

#include <algorithm>

namespace velkhost::cimxml {
namespace {

template <class Members>
bool has_member(const Members &members, std::string_view name) {
    return std::any_of(members.begin(), members.end(),
                       [name](const auto &member) { return cim::same_name(member.name, name); });
}

bool declares(const cim::ClassDecl &declaration, std::string_view name) {
    return has_member(declaration.properties, name) || has_member(declaration.methods, name);
}

// A qualifier without a declaration is what its value looks like.
CMPIType type_of(const cim::Qualifier &qualifier) {
    if (qualifier.type != CMPI_null) {
        return qualifier.type;
    }
    const auto is_boolean = [](const std::string &text) {
        return cim::value_from_text(CMPI_boolean, text).has_value();
    };
    if (qualifier.values.size() != 1) {
        return qualifier.values.empty() ? CMPI_string : CMPI_stringA;
    }
    return is_boolean(qualifier.values.front()) ? CMPI_boolean : CMPI_string;
}

// The text of an initialiser as a value; text that is none of the type is kept as it stands.
cim::Value value_of(CMPIType type, const std::vector<std::string> &texts) {
    const auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
    cim::Value::Array elements;
    for (const std::string &text : texts) {
        elements.push_back(cim::value_from_text(element, text).value_or(cim::Value::string(text)));
    }
    if ((type & CMPI_ARRAY) != 0) {
        return cim::Value::array(element, std::move(elements));
    }
    return elements.empty() ? cim::Value::null(type) : elements.front();
}

class ClassWriter {
  public:
    ClassWriter(XmlWriter &out, const broker::Repository &repository, std::string_view name_space,
                const broker::MergedClass &declared, const ClassForm &form)
        : out_(out),
          repository_(repository),
          name_space_(name_space),
          declared_(declared),
          form_(form) {}

    void write() const;

  private:
    // The attributes that every member has.
    struct Head {
        std::string type;
        std::string origin;
        bool propagated = false;
    };

    [[nodiscard]] bool shows(std::string_view member) const {
        return !form_.local_only || declares(declared_.own, member);
    }
    [[nodiscard]] Head head(std::string_view member, CMPIType type) const;
    void write_property(const cim::PropertyDecl &property) const;
    void write_method(const cim::MethodDecl &method) const;
    void write_parameter(const cim::ParameterDecl &parameter) const;
    void write_qualifiers(const std::vector<cim::Qualifier> &qualifiers) const;

    XmlWriter &out_;
    const broker::Repository &repository_;
    const std::string_view name_space_;
    const broker::MergedClass &declared_;
    const ClassForm &form_;
};

void ClassWriter::write() const {
    const cim::ClassDecl &declaration = declared_.declaration;
    const bool root = declaration.superclass.empty();
    const XmlWriter::Scope whole(
        out_, "CLASS",
        {{"NAME", declaration.name}, {root ? "" : "SUPERCLASS", declaration.superclass}});
    write_qualifiers(declaration.qualifiers);
    for (const cim::PropertyDecl &property : declaration.properties) {
        if (shows(property.name) && (!form_.wanted || form_.wanted(property.name))) {
            write_property(property);
        }
    }
    for (const cim::MethodDecl &method : declaration.methods) {
        if (shows(method.name)) {
            write_method(method);
        }
    }
}

ClassWriter::Head ClassWriter::head(std::string_view member, CMPIType type) const {
    Head result{type_attribute_of(type), {}, false};
    if (form_.class_origin) {
        result.origin = class_origin(repository_, name_space_, declared_, member);
        result.propagated = !declares(declared_.own, member);
    }
    return result;
}

void ClassWriter::write_property(const cim::PropertyDecl &property) const {
    const CMPIType type = property.type.type;
    const Head head = this->head(property.name, type);
    const bool reference = type == CMPI_ref;
    const XmlWriter::Scope scope(
        out_,
        reference                  ? "PROPERTY.REFERENCE"
        : (type & CMPI_ARRAY) != 0 ? "PROPERTY.ARRAY"
                                   : "PROPERTY",
        {{"NAME", property.name},
         {reference ? "" : "TYPE", head.type},
         {reference ? "REFERENCECLASS" : "", property.type.reference_class},
         {head.origin.empty() ? "" : "CLASSORIGIN", head.origin},
         {head.propagated ? "PROPAGATED" : "", "true"}});
    write_qualifiers(property.qualifiers);
    if (property.default_value) {
        write_value(out_, value_of(type, *property.default_value));
    }
}

void ClassWriter::write_method(const cim::MethodDecl &method) const {
    const Head head = this->head(method.name, method.return_type.type);
    const XmlWriter::Scope scope(out_, "METHOD",
                                 {{"NAME", method.name},
                                  {"TYPE", head.type},
                                  {head.origin.empty() ? "" : "CLASSORIGIN", head.origin},
                                  {head.propagated ? "PROPAGATED" : "", "true"}});
    write_qualifiers(method.qualifiers);
    for (const cim::ParameterDecl &parameter : method.parameters) {
        write_parameter(parameter);
    }
}

void ClassWriter::write_parameter(const cim::ParameterDecl &parameter) const {
    const CMPIType type = parameter.type.type;
    const bool array = (type & CMPI_ARRAY) != 0;
    const bool reference = (type & ~CMPI_ARRAY) == CMPI_ref;
    const std::string type_text = type_attribute_of(type);
    const char *const plain = array ? "PARAMETER.ARRAY" : "PARAMETER";
    const char *const referring = array ? "PARAMETER.REFARRAY" : "PARAMETER.REFERENCE";
    const XmlWriter::Scope scope(
        out_, reference ? referring : plain,
        {{"NAME", parameter.name},
         {reference ? "" : "TYPE", type_text},
         {reference ? "REFERENCECLASS" : "", parameter.type.reference_class}});
    write_qualifiers(parameter.qualifiers);
}

void ClassWriter::write_qualifiers(const std::vector<cim::Qualifier> &qualifiers) const {
    if (!form_.qualifiers) {
        return;
    }
    for (const cim::Qualifier &qualifier : qualifiers) {
        const CMPIType type = type_of(qualifier);
        const std::string type_text = type_attribute_of(type);
        const XmlWriter::Scope scope(out_, "QUALIFIER",
                                     {{"NAME", qualifier.name}, {"TYPE", type_text}});
        write_value(out_, value_of(type, qualifier.values));
    }
}

}  // namespace

std::string class_origin(const broker::Repository &repository, std::string_view name_space,
                         const broker::MergedClass &declared, std::string_view member) {
    for (auto name = declared.ancestors.rbegin(); name != declared.ancestors.rend(); ++name) {
        const broker::ClassPointer ancestor = repository.find_class(name_space, *name);
        if (ancestor != nullptr && declares(ancestor->own, member)) {
            return ancestor->declaration.name;
        }
    }
    return declares(declared.own, member) ? declared.declaration.name : std::string();
}

void write_class(XmlWriter &out, const broker::Repository &repository, std::string_view name_space,
                 const broker::MergedClass &declared, const ClassForm &form) {
    ClassWriter(out, repository, name_space, declared, form).write();
}

}  // namespace velkhost::cimxml

// What a class declaration tells of itself.
#include "host/cim/class_decl.h"

#include <gtest/gtest.h>

namespace velkhost::cim {
namespace {

PropertyDecl property_with(const Qualifier &qualifier) {
    return {"P", {CMPI_string, {}}, {qualifier}, {}};
}

ParameterDecl parameter_with(std::vector<Qualifier> qualifiers) {
    return {"P", {CMPI_string, {}}, std::move(qualifiers)};
}

TEST(ClassDecl, QualifierIsFoundWhateverItsCase) {
    const std::vector<Qualifier> qualifiers = {{"Key", {"true"}}, {"MaxLen", {"64"}}};
    EXPECT_EQ(find_qualifier(qualifiers, "maxlen"), &qualifiers[1]);
    EXPECT_EQ(find_qualifier(qualifiers, "KEY"), &qualifiers.front());
    EXPECT_EQ(find_qualifier(qualifiers, "Max"), nullptr);
    EXPECT_EQ(find_qualifier({}, "Key"), nullptr);
}

TEST(ClassDecl, KeyIsWhatIsQualifiedSoAndNotFalse) {
    EXPECT_TRUE(property_with({"Key", {"true"}}).is_key());
    EXPECT_TRUE(property_with({"key", {"TRUE"}}).is_key());
    EXPECT_FALSE(property_with({"Key", {"false"}}).is_key());
    EXPECT_FALSE(property_with({"Key", {}}).is_key()) << "null";
    EXPECT_FALSE(property_with({"Keys", {"true"}}).is_key());
}

TEST(ClassDecl, ParameterIsInputUnlessDenied) {
    EXPECT_TRUE(parameter_with({}).is_in());
    EXPECT_FALSE(parameter_with({}).is_out());
    EXPECT_FALSE(parameter_with({{"In", {"false"}}, {"Out", {"true"}}}).is_in());
    EXPECT_TRUE(parameter_with({{"In", {"false"}}, {"Out", {"true"}}}).is_out());
    EXPECT_TRUE(parameter_with({{"OUT", {"true"}}}).is_in()) << "in and out";
    EXPECT_FALSE(parameter_with({{"Out", {"false"}}}).is_out());
}

TEST(ClassDecl, ClassKnowsItsKind) {
    ClassDecl declared;
    EXPECT_FALSE(declared.is_association());
    EXPECT_FALSE(declared.is_abstract());
    declared.qualifiers = {{"association", {"true"}}, {"ABSTRACT", {"True"}}};
    EXPECT_TRUE(declared.is_association());
    EXPECT_TRUE(declared.is_abstract());
}

}  // namespace
}  // namespace velkhost::cim

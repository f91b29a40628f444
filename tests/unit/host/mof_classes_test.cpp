// Declarations that compile: classes with their members, qualifiers, pragmas, namespaces.
#include "mof_testing.h"

namespace velkhost::mof::testing {
namespace {

using Texts = std::vector<std::string>;

const NamespaceUnit &only_unit(const CompileResult &result) {
    EXPECT_TRUE(result.ok()) << result.error_text();
    static const NamespaceUnit none;
    EXPECT_EQ(result.units.size(), 1U);
    return result.units.empty() ? none : result.units.front();
}

TEST(MofClasses, NothingToDeclareGivesNothing) {
    for (const char *text : {"", " \t\r\n", "// end", "/* all */", "\xEF\xBB\xBF", "/**/ // /*"}) {
        const CompileResult result = compile_text(text, "t.mof");
        EXPECT_TRUE(result.ok()) << text << result.error_text();
        EXPECT_TRUE(result.units.empty()) << text;
    }
}

TEST(MofClasses, ClassesComeInTheOrderOfDeclaration) {
    const auto result = compile_text("class B {}; class A : b {}; class C : A {};", "t.mof");
    const NamespaceUnit &unit = only_unit(result);
    ASSERT_EQ(unit.classes.size(), 3U);
    EXPECT_EQ(unit.classes[0].name, "B");
    EXPECT_EQ(unit.classes[0].superclass, "");
    EXPECT_EQ(unit.classes[1].name, "A");
    EXPECT_EQ(unit.classes[1].superclass, "b");
    EXPECT_EQ(unit.classes[2].superclass, "A");
    EXPECT_EQ(unit.name_space, "root/cimv2");
}

TEST(MofClasses, KeywordsAndTypesIgnoreCase) {
    const cim::ClassDecl declared =
        class_of("[KEY(FALSE)] CLASS T { UINT8 Small = Null; Cim_X Ref Other; };");
    EXPECT_EQ(declared.properties[0].type.type, CMPI_uint8);
    EXPECT_EQ(declared.properties[1].type.type, CMPI_ref);
}

TEST(MofClasses, KeywordsMayBeNamesOfMembers) {
    const cim::ClassDecl declared = class_of("class T { string Class; uint8 Qualifier; };");
    EXPECT_EQ(declared.properties[0].name, "Class");
    EXPECT_EQ(declared.properties[1].name, "Qualifier");
}

TEST(MofClasses, QualifiersKeepTheirValues) {
    const cim::ClassDecl declared = class_of(
        "[Abstract, Association(true), Version(\"2.\" \"1\"), Level(0x10), Empty(null),\n"
        " ValueMap{\"1\", \"2\"} : DisableOverride ToSubclass]\n"
        "class T { [Key] string P; [key(false)] string Q; };");
    EXPECT_TRUE(declared.is_abstract());
    EXPECT_TRUE(declared.is_association());
    ASSERT_EQ(declared.qualifiers.size(), 6U);
    EXPECT_EQ(declared.qualifiers[0].values, Texts{"true"});
    EXPECT_EQ(declared.qualifiers[2].values, Texts{"2.1"});
    EXPECT_EQ(declared.qualifiers[3].values, Texts{"16"});
    EXPECT_EQ(declared.qualifiers[4].values, Texts{});
    EXPECT_EQ(declared.qualifiers[5].name, "ValueMap");
    EXPECT_EQ(declared.qualifiers[5].values, (Texts{"1", "2"}));
    EXPECT_TRUE(declared.properties[0].is_key());
    EXPECT_FALSE(declared.properties[1].is_key());
}

TEST(MofClasses, MethodsHaveTypedParametersWithDirections) {
    const cim::ClassDecl declared = class_of(
        "class T {\n"
        "  [Description(\"d\")] uint32 Run([In] string Uri, [In] uint16 Options[],\n"
        "    [In(false), Out] CIM_Job REF Job, CIM_X REF Targets[2]);\n"
        "  boolean Stop();\n"
        "};");
    ASSERT_EQ(declared.methods.size(), 2U);
    const cim::MethodDecl &run = declared.methods[0];
    EXPECT_EQ(run.name, "Run");
    EXPECT_EQ(run.return_type.type, CMPI_uint32);
    EXPECT_EQ(run.qualifiers.size(), 1U);
    ASSERT_EQ(run.parameters.size(), 4U);
    EXPECT_EQ(run.parameters[1].type.type, CMPI_uint16A);
    EXPECT_TRUE(run.parameters[1].is_in());
    EXPECT_FALSE(run.parameters[1].is_out());
    EXPECT_EQ(run.parameters[2].type.type, CMPI_ref);
    EXPECT_EQ(run.parameters[2].type.reference_class, "CIM_Job");
    EXPECT_FALSE(run.parameters[2].is_in());
    EXPECT_TRUE(run.parameters[2].is_out());
    EXPECT_EQ(run.parameters[3].type.type, CMPI_refA);
    EXPECT_TRUE(run.parameters[3].is_in()) << "In is the default";
    EXPECT_EQ(declared.methods[1].return_type.type, CMPI_boolean);
    EXPECT_TRUE(declared.methods[1].parameters.empty());
}

TEST(MofClasses, PropertyAndMethodMayShareAName) {
    const cim::ClassDecl declared = class_of("class T { string X; uint32 X(string X); };");
    EXPECT_EQ(declared.properties.size(), 1U);
    EXPECT_EQ(declared.methods.size(), 1U);
}

TEST(MofClasses, QualifierDeclarationsAreKept) {
    const auto result = compile_text(
        "Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);\n"
        "Qualifier ValueMap : string[], Scope(any), Flavor(Restricted, Translatable);\n"
        "qualifier MaxLen : uint32 = null, scope(METHOD);",
        "t.mof");
    const NamespaceUnit &unit = only_unit(result);
    ASSERT_EQ(unit.qualifiers.size(), 3U);
    EXPECT_EQ(unit.qualifiers[0].name, "Key");
    EXPECT_EQ(unit.qualifiers[0].type, CMPI_boolean);
    EXPECT_EQ(unit.qualifiers[0].default_value, Texts{"false"});
    EXPECT_EQ(unit.qualifiers[0].scopes, unsigned{kScopeProperty | kScopeReference});
    EXPECT_FALSE(unit.qualifiers[0].flavors.overridable);
    EXPECT_TRUE(unit.qualifiers[0].flavors.to_subclass);
    EXPECT_EQ(unit.qualifiers[1].type, CMPI_stringA);
    EXPECT_EQ(unit.qualifiers[1].default_value, std::nullopt);
    EXPECT_EQ(unit.qualifiers[1].scopes, unsigned{kScopeAny});
    EXPECT_FALSE(unit.qualifiers[1].flavors.to_subclass);
    EXPECT_TRUE(unit.qualifiers[1].flavors.translatable);
    EXPECT_EQ(unit.qualifiers[2].scopes, unsigned{kScopeMethod});
}

TEST(MofClasses, BareQualifierOfAnotherTypeThanBooleanIsNull) {
    const auto result = compile_text(
        "Qualifier Unit : string, Scope(any); [Unit] class T { [UNIT(\"m\")] uint8 P; };", "t.mof");
    const NamespaceUnit &unit = only_unit(result);
    ASSERT_EQ(unit.classes.size(), 1U);
    EXPECT_EQ(unit.classes[0].qualifiers[0].values, Texts{});
    EXPECT_EQ(unit.classes[0].properties[0].qualifiers[0].values, Texts{"m"});
}

TEST(MofClasses, NamespacePragmaParts) {
    const auto result = compile_text(
        "class T {};\n"
        "#pragma namespace (\"velk/cimv2\")\n"
        "class T {}; class U : T {};\n"
        "#pragma namespace (\"ROOT/cimv2\")\n"
        "class V : T {};",
        "t.mof");
    ASSERT_TRUE(result.ok()) << result.error_text();
    ASSERT_EQ(result.units.size(), 2U);
    EXPECT_EQ(result.units[0].name_space, "root/cimv2");
    EXPECT_EQ(result.units[0].classes.size(), 2U);
    EXPECT_EQ(result.units[1].name_space, "velk/cimv2");
    EXPECT_EQ(result.units[1].classes.size(), 2U);
}

TEST(MofClasses, OtherPragmasArePassedOver) {
    EXPECT_EQ(class_of("#pragma locale (\"en_US\")\nclass T {};").name, "T");
}

TEST(MofClasses, OptionsGiveNamespaceAndKnownClasses) {
    const CompileOptions options{"zeb/cimv2", {"CIM_Base"}};
    const auto result = compile_text("class T : cim_base {};", "t.mof", options);
    EXPECT_EQ(only_unit(result).name_space, "zeb/cimv2");
    EXPECT_EQ(only_unit(result).classes.size(), 1U);
}

TEST(MofClasses, LinesMayEndInAnyWay) {
    EXPECT_EQ(class_of("// one\r\nclass T {\r\n string P; // two\r\n};\r\n").properties.size(), 1U);
}

}  // namespace
}  // namespace velkhost::mof::testing

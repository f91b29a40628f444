// The XML of CIM-XML: what is well-formed and what is not, and what is written.
#include "host/cimxml/xml.h"
#include "host/cimxml/xml_writer.h"

#include <gmock/gmock.h>

#include <string>

namespace velkhost::cimxml {
namespace {

std::string text_of(const std::string &document) {
    return read_xml(document).text;
}

std::string escaped(std::string_view text, XmlPlace place = XmlPlace::kText) {
    std::string out;
    append_escaped(out, text, place);
    return out;
}

TEST(CimxmlXml, ElementsAttributesAndTextAreRead) {
    const XmlElement root = read_xml(
        "<?xml version='1.0' encoding=\"UTF-8\"?>\n<!-- c -->\n<!DOCTYPE A SYSTEM \"x\">\n"
        "<A one = '1' two=\"2\"><B/>text<B x='&lt;'>inner</B > more</A>\n<?go on?>");
    EXPECT_EQ(root.name, "A");
    ASSERT_NE(root.attribute("two"), nullptr);
    EXPECT_EQ(*root.attribute("two"), "2");
    EXPECT_EQ(root.attribute("three"), nullptr);
    EXPECT_EQ(root.text, "text more");
    ASSERT_EQ(root.children.size(), 2U);
    EXPECT_EQ(root.children[1].text, "inner");
    EXPECT_EQ(*root.children[1].attribute("x"), "<");
}

TEST(CimxmlXml, ReferencesBecomeCharacters) {
    EXPECT_EQ(text_of("<A>&lt;a&gt;&amp;&quot;&apos;&#65;&#x20AC;&#x1F600;</A>"),
              "<a>&\"'A\xE2\x82\xAC\xF0\x9F\x98\x80");
}

TEST(CimxmlXml, CdataIsTextAndLineEndsAreLineFeeds) {
    EXPECT_EQ(text_of("<A>1<![CDATA[<&]]&gt;]]>2</A>"), "1<&]]&gt;2");
    EXPECT_EQ(text_of("<A>a\r\nb\rc\n</A>"), "a\nb\nc\n");
    EXPECT_EQ(*read_xml("<A b='1\n2\t3'/>").attribute("b"), "1 2 3");
    EXPECT_EQ(text_of("<A>&#13;</A>"), "\r");
}

TEST(CimxmlXml, ByteOrderMarkIsPassedOver) {
    EXPECT_EQ(read_xml("\xEF\xBB\xBF<A/>").name, "A");
}

class CimxmlXmlBad : public ::testing::TestWithParam<const char *> {};

TEST_P(CimxmlXmlBad, DocumentIsRefused) {
    EXPECT_THROW(read_xml(GetParam()), XmlError);
}

INSTANTIATE_TEST_SUITE_P(
    All, CimxmlXmlBad,
    ::testing::Values("", " ", "A", "<A", "<A>", "<A></B>", "<A/><B/>", "<A/>x", "<A b=1/>",
                      "<A b='1' b='2'/>", "<A b='<'/>", "<A b='1'c='2'/>", "<A>&</A>",
                      "<A>&nope;</A>", "<A>&#0;</A>", "<A>&#xD800;</A>", "<A>&#x110000;</A>",
                      "<A>&#12a;</A>", "<A>a<b>&c</A>", "<A>]]></A>", "<A><![CDATA[x</A>",
                      "<A><!-- -- --></A>", "<A><?xml version='1.0'?></A>", "<1/>", "<A>\x01</A>",
                      "<A>\xFF</A>", "<A>\xC0\x80</A>", "<!DOCTYPE A [<!ENTITY x 'y'>]><A>&x;</A>",
                      "<?xml version='1.0' encoding='utf-16'?><A/>"));

TEST(CimxmlXml, DepthIsBounded) {
    std::string deep;
    for (int i = 0; i < kDeepestElement; ++i) {
        deep += "<A>";
    }
    std::string good = deep;
    for (int i = 0; i < kDeepestElement; ++i) {
        good += "</A>";
    }
    EXPECT_EQ(read_xml(good).name, "A");
    EXPECT_THROW(read_xml(deep + "<A>"), XmlError);
    EXPECT_THROW(read_xml(std::string(1'000'000, '<')), XmlError);
}

TEST(CimxmlXml, EveryCutOfADocumentIsRefused) {
    const std::string document =
        R"(<?xml version="1.0"?><A b="1&amp;2"><!-- c --><B><![CDATA[d]]></B>e&#65;</A>)";
    EXPECT_EQ(read_xml(document).name, "A");
    for (std::size_t length = 0; length < document.size(); ++length) {
        EXPECT_THROW(read_xml(document.substr(0, length)), XmlError) << length;
    }
}

TEST(CimxmlXml, EscapesDifferBetweenTextAndAttributes) {
    EXPECT_EQ(escaped("a<b>&\"\t\n\r"), "a&lt;b&gt;&amp;\"\t\n&#13;");
    EXPECT_EQ(escaped("a<b>&\"\t\n\r", XmlPlace::kAttribute),
              "a&lt;b&gt;&amp;&quot;&#9;&#10;&#13;");
}

TEST(CimxmlXml, WhatNoDocumentMayHoldIsReplaced) {
    EXPECT_EQ(escaped(std::string_view("a\0b\x1F", 4)),
              "a\xEF\xBF\xBD"
              "b\xEF\xBF\xBD");
    EXPECT_EQ(escaped("a\xFFz\xE2\x82"), "a\xEF\xBF\xBDz\xEF\xBF\xBD\xEF\xBF\xBD");
    EXPECT_EQ(escaped("\xEF\xBF\xBE"), "\xEF\xBF\xBD");
    EXPECT_EQ(escaped("\xE2\x82\xAC"), "\xE2\x82\xAC");
}

TEST(CimxmlXml, WrittenTextIsReadBack) {
    const std::string text = "<&>\"'\r\n\t \xE2\x82\xAC ]]>";
    XmlWriter out;
    {
        const XmlWriter::Scope root(out, "A", {{"b", text}, {"", "left out"}});
        out.leaf("C", text);
    }
    const XmlElement root = read_xml(out.text());
    EXPECT_EQ(*root.attribute("b"), text);
    EXPECT_EQ(root.attributes.size(), 1U);
    EXPECT_EQ(root.children.at(0).text, text);
}

}  // namespace
}  // namespace velkhost::cimxml

#include "foundation/FoundationSupport.h"
#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"

#include <xercesc/dom/DOM.hpp>

#include <gtest/gtest.h>

using namespace foundation_test;
using namespace XERCES_CPP_NAMESPACE;
using plotaid::detail::ValidatingParser;
using plotaid::detail::XercesRuntime;

namespace {

std::string chart(const std::string& body, const std::string& doctype = "") {
    return "<?xml version=\"1.0\"?>" + doctype +
           "<chart xmlns=\"http://plotaid.org/test\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/test http://plotaid.org/test/foundation-test.xsd\">" +
           body + "</chart>";
}

std::string attribute(const DOMElement* element, const char16_t* name) {
    std::string out;
    for (const XMLCh* c = element->getAttribute(name); *c; ++c)
        out += static_cast<char>(*c);
    return out;
}

const ChartException kFailure("parseDocument fatal error while parsing",
                              "backend/chartxml/plotaid/src/chartbase", 1105);

class Parsing : public ::testing::Test {
protected:
    TestResources resources;
    DumpFolder dumps{std::string("0000000001")};
    ValidatingParser parser;

    const DOMDocument* parse(const std::string& text) { return parser.parse(text, "ChartBase", kFailure); }
    std::string errors() const {
        std::string all;
        for (const std::string& e : parser.lastErrors())
            all += e + "\n";
        return all;
    }
};

TEST_F(Parsing, ValidDocumentsAndWrongDataTypeValuesParseWithoutAnyRecord) {
    const DOMDocument* doc = parse(chart("<item id=\"a\" count=\"3\" percent=\"50\"/><size>4</size>"));
    ASSERT_NE(doc, nullptr);
    EXPECT_TRUE(parser.lastErrors().empty());
    // Validation with the schema: the ID attribute is known as such.
    ASSERT_NE(doc->getElementById(u"a"), nullptr);
    EXPECT_EQ(attribute(doc->getElementById(u"a"), u"count"), "3");

    // Above the maximum, below the minimum, no integer, a decimal for an integer, malformed double and
    // decimal, no boolean, outside the enumeration, no such month: kept as written.
    for (const std::string value :
         {"percent=\"101\"", "percent=\"-1\"", "count=\"x\"", "count=\"1.5\"", "weight=\"1.2.3\"",
          "share=\"1..2\"", "visible=\"yes\"", "shape=\"triangle\"", "day=\"2026-13-01\""}) {
        doc = parse(chart("<item " + value + "/><size>seven</size>"));
        ASSERT_NE(doc, nullptr) << value;
        const auto* item = static_cast<const DOMElement*>(doc->getDocumentElement()->getFirstElementChild());
        const std::string name = value.substr(0, value.find('='));
        const std::u16string wide(name.begin(), name.end());
        EXPECT_EQ(attribute(item, wide.c_str()),
                  value.substr(name.size() + 2, value.size() - name.size() - 3));
    }
    // Repeated identifiers pass like other value errors.
    EXPECT_NE(parse(chart("<item id=\"a\"/><item id=\"a\"/>")), nullptr);
    EXPECT_FALSE(dumps.hasLog()) << dumps.log();
    EXPECT_FALSE(std::filesystem::exists(dumps.dir().file("parseError_00.xml")));
}

TEST_F(Parsing, UndeclaredElementStopsTheParseWithRecordAndDump) {
    const std::string text = chart("<item/><bogus/>");
    EXPECT_EQ(parse(text), nullptr);
    const std::string log = dumps.log();
    EXPECT_NE(
        log.find(
            "Error -- SAX Parser: no declaration found for element 'bogus' at file ChartBase, line 1, char"),
        std::string::npos)
        << log;
    EXPECT_NE(log.find("Error -- ChartXML: parseDocument fatal error while parsing at file "
                       "backend/chartxml/plotaid/src/chartbase, line 1105, char 0\n"),
              std::string::npos)
        << log;
    EXPECT_EQ(readAll(dumps.dir().file("parseError_00.xml")), text);
    ASSERT_EQ(parser.lastErrors().size(), 1u);
    EXPECT_EQ(parser.lastErrors()[0].rfind("ChartBase:1:", 0), 0u) << parser.lastErrors()[0];
    EXPECT_NE(parser.lastErrors()[0].find("'bogus'"), std::string::npos);
    // No dump when kind nine is off.
    std::filesystem::remove(dumps.dir().file("parseError_00.xml"));
    ScopedEnv options("DumpChartXMLOptions", "1111111110");
    EXPECT_EQ(parse(text), nullptr);
    EXPECT_FALSE(std::filesystem::exists(dumps.dir().file("parseError_00.xml")));
}

TEST_F(Parsing, WarningsMalformedTextAndAMissingSchemaFail) {
    // Declares UTF-16 over UTF-8 bytes: the parser warns and carries on, we do not.
    EXPECT_EQ(parse("<?xml version=\"1.0\" encoding=\"UTF-16\"?>" + chart("").substr(21)), nullptr);
    EXPECT_NE(dumps.log().find("Warning -- SAX Parser: "), std::string::npos) << dumps.log();
    for (const std::string& text : {std::string("<chart"), std::string(), std::string("\0\0\0", 3)}) {
        EXPECT_EQ(parse(text), nullptr);
        EXPECT_FALSE(parser.lastErrors().empty());
    }
    EXPECT_NE(dumps.log().find("Fatal Error -- SAX Parser:"), std::string::npos);
    TempDir empty;
    ScopedEnv folder("PLOTAID_RESOURCE_DIR", empty.path());
    EXPECT_EQ(parse(chart("<item/>")), nullptr);
    EXPECT_NE(dumps.log().find("resolveEntity refused"), std::string::npos);
}

TEST_F(Parsing, ParserIsReusableAndAnAdoptedDocumentOutlivesLaterParses) {
    EXPECT_EQ(parse(chart("<bogus/>")), nullptr);
    EXPECT_EQ(parser.adoptDocument(), nullptr) << "a failed parse has no document to give";
    ASSERT_NE(parse(chart("<label>kept</label>")), nullptr);
    EXPECT_TRUE(parser.lastErrors().empty());
    plotaid::detail::OwnedDocument mine = parser.adoptDocument();
    ASSERT_NE(mine, nullptr);
    EXPECT_EQ(parser.adoptDocument(), nullptr) << "adopted twice";
    ASSERT_NE(parse(chart("<label>other</label>")), nullptr);
    ASSERT_NE(parse(chart("<label>third</label>")), nullptr);
    EXPECT_EQ(std::u16string(mine->getDocumentElement()->getTextContent()), u"kept");
}

TEST_F(Parsing, BillionLaughsIsRefused) {
    std::string doctype = "<!DOCTYPE chart [<!ENTITY l0 \"ha\">";
    for (int level = 1; level <= 10; ++level) {
        const std::string below = "&l" + std::to_string(level - 1) + ";";
        doctype += "<!ENTITY l" + std::to_string(level) + " \"";
        for (int i = 0; i < 10; ++i)
            doctype += below;
        doctype += "\">";
    }
    doctype += "]>";
    EXPECT_EQ(parse(chart("<label>&l10;</label>", doctype)), nullptr);
    EXPECT_NE(dumps.log().find(
                  "Fatal Error -- SAX Parser: parser has encountered more than '5000' entity expansions"),
              std::string::npos)
        << dumps.log();
}

std::string nestedGroups(std::size_t depth) {
    std::string body;
    for (std::size_t i = 0; i < depth; ++i)
        body += "<group>";
    for (std::size_t i = 0; i < depth; ++i)
        body += "</group>";
    return chart(body);
}

TEST_F(Parsing, NestingIsBoundedWhileDeepTreesStillParse) {
    // The chart element itself is one level.
    EXPECT_NE(parse(nestedGroups(ValidatingParser::kNestingLimit - 1)), nullptr);
    EXPECT_EQ(parse(nestedGroups(ValidatingParser::kNestingLimit)), nullptr);
    ASSERT_FALSE(parser.lastErrors().empty());
    EXPECT_NE(parser.lastErrors().front().find("nested more than 1024 deep"), std::string::npos)
        << parser.lastErrors().front();
    // A hostile depth is refused as soon as the limit is passed, not after the whole text.
    EXPECT_EQ(parse(nestedGroups(200000)), nullptr);
    EXPECT_NE(dumps.log().find("Fatal Error -- SAX Parser: elements are nested more than"),
              std::string::npos);
}

TEST_F(Parsing, HugeEntityIsRefusedButModestOnesAndReferencesExpand) {
    const std::string big(ValidatingParser::kEntityValueLimit + 1, 'x');
    const std::string refs = "&big;&big;&big;&big;&big;&big;&big;&big;";
    EXPECT_EQ(parse(chart("<label>" + refs + "</label>", "<!DOCTYPE chart [<!ENTITY big \"" + big + "\">]>")),
              nullptr);
    EXPECT_NE(dumps.log().find("limit imposed by the application"), std::string::npos);
    const std::string fits(ValidatingParser::kEntityValueLimit, 'y');
    const DOMDocument* doc =
        parse(chart("<label>" + refs + "</label>", "<!DOCTYPE chart [<!ENTITY big \"" + fits + "\">]>"));
    ASSERT_NE(doc, nullptr) << errors();
    EXPECT_EQ(std::u16string(doc->getDocumentElement()->getTextContent()).size(), 8 * fits.size());
    // Predefined and character references are not counted as expansions.
    std::string text;
    for (std::size_t i = 0; i < 2 * ValidatingParser::kEntityExpansionLimit; ++i)
        text += "&amp;&#65;";
    doc = parse(chart("<label>" + text + "</label>"));
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(std::u16string(doc->getDocumentElement()->getTextContent()).size(),
              4 * ValidatingParser::kEntityExpansionLimit);
}

// Documents that try to pull a file from outside the resource folder into the parse; a bare file name
// must not be found in the working folder either.
TEST_F(Parsing, EntitiesAndDoctypesOutsideTheResourceFolderAreRefused) {
    ScopedCwd beside(testData(""));
    const std::string marker = std::filesystem::canonical(testData("marker.txt")).string();
    const std::string dtd = std::filesystem::canonical(testData("marker.dtd")).string();
    for (const std::string& doctype :
         {"<!DOCTYPE chart [<!ENTITY leaked SYSTEM \"file://" + marker + "\">]>",
          "<!DOCTYPE chart [<!ENTITY leaked SYSTEM \"" + marker + "\">]>",
          std::string("<!DOCTYPE chart [<!ENTITY leaked SYSTEM \"marker.txt\">]>"),
          std::string("<!DOCTYPE chart [<!ENTITY leaked SYSTEM \"http://plotaid.org/../../marker.txt\">]>"),
          std::string("<!DOCTYPE chart SYSTEM \"marker.dtd\">"),
          "<!DOCTYPE chart SYSTEM \"file://" + dtd + "\">",
          std::string("<!DOCTYPE chart PUBLIC \"-//Test//EN\" \"http://plotaid.org/marker.dtd\">"),
          "<!DOCTYPE chart [<!ENTITY % outside SYSTEM \"" + dtd + "\"> %outside;]>"}) {
        SCOPED_TRACE(doctype);
        EXPECT_EQ(parse(chart("<label>&leaked;</label>", doctype)), nullptr);
        EXPECT_NE(errors().find("refused to read"), std::string::npos) << errors();
        EXPECT_EQ(errors().find("MARKER-OUTSIDE-THE-RESOURCE-FOLDER"), std::string::npos) << errors();
    }
    const std::string log = dumps.log();
    EXPECT_NE(log.find("resolveEntity refused"), std::string::npos) << log;
    EXPECT_EQ(log.find("MARKER-OUTSIDE-THE-RESOURCE-FOLDER"), std::string::npos) << log;
}

TEST(XercesRuntimeCount, CopiesAreReferencesAndTheLastOneTerminates) {
    const unsigned base = XercesRuntime::references();
    {
        XercesRuntime first;
        ASSERT_TRUE(first.ready());
        EXPECT_EQ(XercesRuntime::references(), base + 1);
        XercesRuntime second(first);
        EXPECT_EQ(XercesRuntime::references(), base + 2);
        second = first;
        EXPECT_EQ(XercesRuntime::references(), base + 2);
    }
    EXPECT_EQ(XercesRuntime::references(), base);
    // Up again after a full stop, and a parser holds its own reference.
    TestResources resources;
    for (int round = 0; round < 2; ++round) {
        ValidatingParser parser;
        EXPECT_EQ(XercesRuntime::references(), base + 1);
        EXPECT_NE(parser.parse(chart("<item/>"), "ChartBase", kFailure), nullptr);
    }
    EXPECT_EQ(XercesRuntime::references(), base);
}

} // namespace

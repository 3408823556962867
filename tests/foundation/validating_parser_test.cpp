#include "foundation/FoundationSupport.h"
#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"

#include <xercesc/dom/DOM.hpp>

#include <gtest/gtest.h>

#include <sys/resource.h>

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
};

TEST_F(Parsing, ValidDocumentParsesWithoutAnyRecord) {
    const DOMDocument* doc = parser.parse(chart("<item id=\"a\" count=\"3\" percent=\"50\"/><size>4</size>"),
                                          "ChartBase", kFailure);
    ASSERT_NE(doc, nullptr);
    EXPECT_TRUE(parser.lastErrors().empty());
    EXPECT_FALSE(dumps.hasLog());
    // Validation with the schema: the ID attribute is known as such.
    ASSERT_NE(doc->getElementById(u"a"), nullptr);
    EXPECT_EQ(attribute(doc->getElementById(u"a"), u"count"), "3");
}

TEST_F(Parsing, ValuesOfAWrongDataTypeNeitherLogNorStop) {
    const std::string values[] = {
        "percent=\"101\"",    // above the maximum
        "percent=\"-1\"",     // below the minimum
        "count=\"x\"",        // not an integer at all
        "count=\"1.5\"",      // a decimal where an integer belongs
        "weight=\"1.2.3\"",   // malformed double
        "share=\"1..2\"",     // malformed decimal
        "visible=\"yes\"",    // not a boolean
        "shape=\"triangle\"", // not in the enumeration
        "day=\"2026-13-01\"", // no such month
    };
    for (const std::string& value : values) {
        const DOMDocument* doc =
            parser.parse(chart("<item " + value + "/><size>seven</size>"), "ChartBase", kFailure);
        ASSERT_NE(doc, nullptr) << value;
        // The value is kept as written.
        const auto* item = static_cast<const DOMElement*>(doc->getDocumentElement()->getFirstElementChild());
        const std::string name = value.substr(0, value.find('='));
        const std::u16string wide(name.begin(), name.end());
        EXPECT_EQ(attribute(item, wide.c_str()),
                  value.substr(name.size() + 2, value.size() - name.size() - 3));
    }
    EXPECT_FALSE(dumps.hasLog()) << dumps.log();
    EXPECT_FALSE(std::filesystem::exists(dumps.dir().file("parseError_00.xml")));
}

TEST_F(Parsing, DuplicateIdentifiersPassLikeOtherValueErrors) {
    EXPECT_NE(parser.parse(chart("<item id=\"a\"/><item id=\"a\"/>"), "ChartBase", kFailure), nullptr);
    EXPECT_FALSE(dumps.hasLog());
}

TEST_F(Parsing, UndeclaredElementStopsTheParseWithRecordAndDump) {
    const std::string text = chart("<item/><bogus/>");
    EXPECT_EQ(parser.parse(text, "ChartBase", kFailure), nullptr);
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
    EXPECT_EQ(DumpFolder::read(dumps.dir().file("parseError_00.xml")), text);
    ASSERT_EQ(parser.lastErrors().size(), 1u);
    EXPECT_EQ(parser.lastErrors()[0].rfind("ChartBase:1:", 0), 0u) << parser.lastErrors()[0];
    EXPECT_NE(parser.lastErrors()[0].find("'bogus'"), std::string::npos);
}

TEST_F(Parsing, NoDumpWhenKindNineIsOff) {
    ScopedEnv options("DumpChartXMLOptions", std::string("1111111110"));
    EXPECT_EQ(parser.parse(chart("<bogus/>"), "ChartBase", kFailure), nullptr);
    EXPECT_FALSE(std::filesystem::exists(dumps.dir().file("parseError_00.xml")));
    EXPECT_TRUE(dumps.hasLog());
}

TEST_F(Parsing, WarningStopsTheParse) {
    // Declares UTF-16 over UTF-8 bytes: the parser warns and carries on, we do not.
    const std::string text = "<?xml version=\"1.0\" encoding=\"UTF-16\"?>" + chart("").substr(21);
    EXPECT_EQ(parser.parse(text, "ChartBase", kFailure), nullptr);
    EXPECT_NE(dumps.log().find("Warning -- SAX Parser: "), std::string::npos) << dumps.log();
}

TEST_F(Parsing, MalformedTextAndEmptyTextFail) {
    for (const std::string& text : {std::string("<chart"), std::string(), std::string("\0\0\0", 3)}) {
        EXPECT_EQ(parser.parse(text, "ChartBase", kFailure), nullptr);
        EXPECT_FALSE(parser.lastErrors().empty());
    }
    EXPECT_NE(dumps.log().find("Fatal Error -- SAX Parser:"), std::string::npos);
}

TEST_F(Parsing, MissingSchemaFailsTheParse) {
    TempDir empty;
    ScopedEnv folder("PLOTAID_RESOURCE_DIR", empty.path());
    EXPECT_EQ(parser.parse(chart("<item/>"), "ChartBase", kFailure), nullptr);
    EXPECT_NE(dumps.log().find("resolveEntity refused"), std::string::npos);
}

TEST_F(Parsing, ParserIsReusableAfterAFailure) {
    EXPECT_EQ(parser.parse(chart("<bogus/>"), "ChartBase", kFailure), nullptr);
    EXPECT_NE(parser.parse(chart("<item/>"), "ChartBase", kFailure), nullptr);
    EXPECT_TRUE(parser.lastErrors().empty());
}

TEST_F(Parsing, AdoptedDocumentOutlivesLaterParses) {
    ASSERT_NE(parser.parse(chart("<label>kept</label>"), "ChartBase", kFailure), nullptr);
    plotaid::detail::OwnedDocument mine = parser.adoptDocument();
    ASSERT_NE(mine, nullptr);
    EXPECT_EQ(parser.adoptDocument(), nullptr) << "adopted twice";
    ASSERT_NE(parser.parse(chart("<label>other</label>"), "ChartBase", kFailure), nullptr);
    ASSERT_NE(parser.parse(chart("<label>third</label>"), "ChartBase", kFailure), nullptr);
    const XMLCh* text = mine->getDocumentElement()->getTextContent();
    EXPECT_EQ(std::u16string(text), u"kept");
    EXPECT_EQ(parser.parse(chart("<bogus/>"), "ChartBase", kFailure), nullptr);
    EXPECT_EQ(parser.adoptDocument(), nullptr) << "a failed parse has no document to give";
}

#if defined(__SANITIZE_ADDRESS__)
constexpr bool kSanitized = true;
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
constexpr bool kSanitized = true;
#else
constexpr bool kSanitized = false;
#endif
#else
constexpr bool kSanitized = false;
#endif

long maxResidentKiB() {
    rusage usage{};
    ::getrusage(RUSAGE_SELF, &usage);
    return usage.ru_maxrss;
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
    // Schema loading and first-use costs are not the attack's.
    ASSERT_NE(parser.parse(chart("<label>warm</label>"), "ChartBase", kFailure), nullptr);
    const long before = maxResidentKiB();
    EXPECT_EQ(parser.parse(chart("<label>&l10;</label>", doctype), "ChartBase", kFailure), nullptr);
    // AddressSanitizer keeps freed blocks in quarantine, so only a plain build shows the real peak.
    if (!kSanitized) {
        EXPECT_LT(maxResidentKiB() - before, 8 * 1024) << "KiB grown";
    }
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
    EXPECT_NE(parser.parse(nestedGroups(ValidatingParser::kNestingLimit - 1), "ChartBase", kFailure),
              nullptr);
    EXPECT_EQ(parser.parse(nestedGroups(ValidatingParser::kNestingLimit), "ChartBase", kFailure), nullptr);
    ASSERT_FALSE(parser.lastErrors().empty());
    EXPECT_NE(parser.lastErrors().front().find("nested more than 1024 deep"), std::string::npos)
        << parser.lastErrors().front();
    // A hostile depth is refused as soon as the limit is passed, not after the whole text.
    EXPECT_EQ(parser.parse(nestedGroups(200000), "ChartBase", kFailure), nullptr);
    EXPECT_NE(dumps.log().find("Fatal Error -- SAX Parser: elements are nested more than"),
              std::string::npos);
}

TEST_F(Parsing, HugeEntityIsRefusedButModestOnesExpand) {
    const std::string big(ValidatingParser::kEntityValueLimit + 1, 'x');
    const std::string refs = "&big;&big;&big;&big;&big;&big;&big;&big;";
    EXPECT_EQ(
        parser.parse(chart("<label>" + refs + "</label>", "<!DOCTYPE chart [<!ENTITY big \"" + big + "\">]>"),
                     "ChartBase", kFailure),
        nullptr);
    EXPECT_NE(dumps.log().find("limit imposed by the application"), std::string::npos);
    const std::string fits(ValidatingParser::kEntityValueLimit, 'y');
    const DOMDocument* doc = parser.parse(
        chart("<label>" + refs + "</label>", "<!DOCTYPE chart [<!ENTITY big \"" + fits + "\">]>"),
        "ChartBase", kFailure);
    ASSERT_NE(doc, nullptr) << (parser.lastErrors().empty() ? "" : parser.lastErrors()[0]);
    EXPECT_EQ(std::u16string(doc->getDocumentElement()->getTextContent()).size(), 8 * fits.size());
}

TEST_F(Parsing, PredefinedAndCharacterReferencesAreNotCountedAsExpansions) {
    std::string text;
    for (std::size_t i = 0; i < 2 * ValidatingParser::kEntityExpansionLimit; ++i)
        text += "&amp;&#65;";
    const DOMDocument* doc = parser.parse(chart("<label>" + text + "</label>"), "ChartBase", kFailure);
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(std::u16string(doc->getDocumentElement()->getTextContent()).size(),
              4 * ValidatingParser::kEntityExpansionLimit);
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

namespace {

// The library's own grammar, read from the source tree's resource folder: every bundled sample
// validates, and the imports between schemas resolve through the same resolver.
TEST(BundledSamples, ValidateAgainstTheResourceGrammars) {
    ScopedEnv folder("PLOTAID_RESOURCE_DIR", std::string(PLOTAID_SOURCE_DIR) + "/resources");
    DumpFolder dumps;
    ValidatingParser parser;
    int parsed = 0;
    for (const char* sub : {"/charts", "/data"}) {
        const std::filesystem::path dir = std::string(PLOTAID_EXAMPLES_DIR) + sub;
        if (!std::filesystem::is_directory(dir))
            continue;
        for (const auto& entry : std::filesystem::directory_iterator(dir)) {
            if (entry.path().extension() != ".xml")
                continue;
            const std::string text = DumpFolder::read(entry.path().string());
            EXPECT_NE(parser.parse(text, "ChartBase", kFailure), nullptr)
                << entry.path() << ": " << (parser.lastErrors().empty() ? "" : parser.lastErrors()[0]);
            ++parsed;
        }
    }
    EXPECT_GT(parsed, 0);
    EXPECT_FALSE(dumps.hasLog()) << dumps.log();
}

} // namespace

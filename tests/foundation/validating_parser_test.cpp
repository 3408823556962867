#include "foundation/FoundationSupport.h"
#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"
#include "support/EngineSupport.h"

#include <plotaid/ChartErrorHandler.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/sax/InputSource.hpp>

#include <regex>
#include <thread>

using namespace foundation_test;
using namespace XERCES_CPP_NAMESPACE;
using engine_test::example;
using plotaid::detail::DocumentKind;
using plotaid::detail::ValidatingParser;
using plotaid::detail::XercesRuntime;

namespace {

std::string chart(const std::string& body, const std::string& doctype = "") {
    return "<?xml version=\"1.0\"?>" + doctype +
           "<chart xmlns=\"http://plotaid.org/test\" xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/test http://plotaid.org/test/foundation-test.xsd\">" +
           body + "</chart>";
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
    std::string text(const DOMDocument* doc) { return utf8(doc->getDocumentElement()->getTextContent()); }
};

// Above the maximum, below the minimum, no integer, a decimal for an integer, malformed double and
// decimal, no boolean, outside the enumeration, no such month, a repeated id: kept as written.
TEST_F(Parsing, ValidDocumentsAndWrongDataTypeValuesParseWithoutAnyRecord) {
    const DOMDocument* doc = parse(chart("<item id=\"a\" count=\"3\" percent=\"50\"/><size>4</size>"));
    ASSERT_NE(doc, nullptr);
    EXPECT_TRUE(parser.lastErrors().empty());
    ASSERT_NE(doc->getElementById(u"a"), nullptr) << "the schema makes it an ID";
    for (const std::string value : {"percent=\"101\"", "percent=\"-1\"", "count=\"x\"", "count=\"1.5\"",
                                    "weight=\"1.2.3\"", "share=\"1..2\"", "visible=\"yes\"",
                                    "shape=\"triangle\"", "day=\"2026-13-01\"", "id=\"a\"/><item id=\"a\""}) {
        doc = parse(chart("<item " + value + "/><size>seven</size>"));
        ASSERT_NE(doc, nullptr) << value;
        const std::string name = value.substr(0, value.find('='));
        const DOMElement* item = doc->getDocumentElement()->getFirstElementChild();
        EXPECT_EQ(name + "=\"" + utf8(item->getAttribute(ChartString(name).xc_str())) + "\"",
                  value.substr(0, value.find('"', name.size() + 2) + 1));
    }
    EXPECT_FALSE(dumps.hasLog()) << dumps.log();
    EXPECT_FALSE(std::filesystem::exists(dumps.dir().file("parseError_00.xml")));
}

// Declaring UTF-16 over UTF-8 bytes makes the parser warn and carry on; we stop. Every failure is
// logged, and the text dumped when kind nine is on.
TEST_F(Parsing, UndeclaredElementsWarningsMalformedTextAndAMissingSchemaFailWithRecords) {
    const std::string text = chart("<item/><bogus/>");
    const std::pair<std::string, const char*> rows[] = {
        {text, "Error -- SAX Parser: no declaration found for element 'bogus' at file ChartBase"},
        {text, "Error -- ChartXML: parseDocument fatal error while parsing at file "},
        {"<?xml version=\"1.0\" encoding=\"UTF-16\"?>" + chart("").substr(21), "Warning -- SAX Parser: "},
        {"<chart", "Fatal Error -- SAX Parser:"},
        {"", "Fatal Error -- SAX Parser:"},
        {std::string("\0\0\0", 3), "Fatal Error -- SAX Parser:"}};
    for (const auto& [bad, record] : rows) {
        std::filesystem::remove(dumps.dir().file("parseError_00.xml"));
        EXPECT_EQ(parse(bad), nullptr);
        EXPECT_FALSE(parser.lastErrors().empty());
        EXPECT_NE(dumps.log().find(record), std::string::npos) << record << "\n" << dumps.log();
        EXPECT_EQ(readAll(dumps.dir().file("parseError_00.xml")), bad);
    }
    EXPECT_EQ(parse(text), nullptr);
    ASSERT_EQ(parser.lastErrors().size(), 1u);
    EXPECT_TRUE(std::regex_match(parser.lastErrors()[0], std::regex("ChartBase:1:[0-9]+: .*'bogus'.*")));
    std::filesystem::remove(dumps.dir().file("parseError_00.xml"));
    ScopedEnv options("DumpChartXMLOptions", "1111111110"); // kind nine off
    EXPECT_EQ(parse(text), nullptr);
    EXPECT_FALSE(std::filesystem::exists(dumps.dir().file("parseError_00.xml")));
    TempDir empty;
    ScopedEnv folder("PLOTAID_RESOURCE_DIR", empty.path());
    EXPECT_EQ(parse(chart("<item/>")), nullptr);
    EXPECT_EQ(parser.parse(example("charts/pie.xml"), "ChartBase", kFailure, DocumentKind::Chart), nullptr);
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
    ScopedEnv bundled("PLOTAID_RESOURCE_DIR", std::string(PLOTAID_SOURCE_DIR) + "/resources");
    ASSERT_NE(parser.parse(example("charts/pie.xml"), "ChartBase", kFailure, DocumentKind::Chart), nullptr);
    EXPECT_EQ(utf8(mine->getDocumentElement()->getTextContent()), "kept");
}

// The chart element itself is one level. A hostile depth is refused as soon as the limit is passed;
// entities are bounded in count and length, predefined and character references are not counted.
TEST_F(Parsing, NestingAndEntityExpansionAreBounded) {
    const auto nested = [](std::size_t depth) {
        std::string open, close;
        for (std::size_t i = 0; i < depth; ++i)
            open += "<group>", close += "</group>";
        return chart(open + close);
    };
    EXPECT_NE(parse(nested(ValidatingParser::kNestingLimit - 1)), nullptr);
    EXPECT_EQ(parse(nested(ValidatingParser::kNestingLimit)), nullptr);
    EXPECT_NE(errors().find("nested more than 1024 deep"), std::string::npos);
    EXPECT_EQ(parse(nested(200000)), nullptr);

    std::string laughs = "<!DOCTYPE chart [<!ENTITY l0 \"ha\">";
    for (int level = 1; level <= 10; ++level) {
        laughs += "<!ENTITY l" + std::to_string(level) + " \"";
        for (int i = 0; i < 10; ++i)
            laughs += "&l" + std::to_string(level - 1) + ";";
        laughs += "\">";
    }
    EXPECT_EQ(parse(chart("<label>&l10;</label>", laughs + "]>")), nullptr);
    EXPECT_NE(dumps.log().find("more than '5000' entity expansions"), std::string::npos);
    const auto withBig = [&](std::size_t length) {
        return chart("<label>&big;&big;&big;&big;&big;&big;&big;&big;</label>",
                     "<!DOCTYPE chart [<!ENTITY big \"" + std::string(length, 'y') + "\">]>");
    };
    EXPECT_EQ(parse(withBig(ValidatingParser::kEntityValueLimit + 1)), nullptr);
    EXPECT_NE(dumps.log().find("limit imposed by the application"), std::string::npos);
    const DOMDocument* doc = parse(withBig(ValidatingParser::kEntityValueLimit));
    ASSERT_NE(doc, nullptr) << errors();
    EXPECT_EQ(text(doc).size(), 8 * ValidatingParser::kEntityValueLimit);
    std::string refs;
    for (std::size_t i = 0; i < 2 * ValidatingParser::kEntityExpansionLimit; ++i)
        refs += "&amp;&#65;";
    doc = parse(chart("<label>" + refs + "</label>"));
    ASSERT_NE(doc, nullptr);
    EXPECT_EQ(text(doc).size(), 4 * ValidatingParser::kEntityExpansionLimit);
}

// Documents that try to pull a file from outside the resource folder into the parse; a bare file name
// must not be found in the working folder either.
TEST_F(Parsing, EntitiesAndDoctypesOutsideTheResourceFolderAreRefused) {
    ScopedCwd beside(testData(""));
    const std::string marker = std::filesystem::canonical(testData("marker.txt")).string();
    const std::string dtd = std::filesystem::canonical(testData("marker.dtd")).string();
    for (const std::string& doctype :
         {"<!DOCTYPE chart [<!ENTITY leaked SYSTEM \"" + marker + "\">]>",
          std::string("<!DOCTYPE chart [<!ENTITY leaked SYSTEM \"marker.txt\">]>"),
          std::string("<!DOCTYPE chart SYSTEM \"marker.dtd\">"),
          std::string("<!DOCTYPE chart PUBLIC \"-//Test//EN\" \"http://plotaid.org/marker.dtd\">"),
          "<!DOCTYPE chart [<!ENTITY % outside SYSTEM \"" + dtd + "\"> %outside;]>"}) {
        SCOPED_TRACE(doctype);
        EXPECT_EQ(parse(chart("<label>&leaked;</label>", doctype)), nullptr);
        EXPECT_NE(errors().find("refused to read"), std::string::npos) << errors();
        EXPECT_EQ(errors().find("MARKER-OUTSIDE-THE-RESOURCE-FOLDER"), std::string::npos) << errors();
    }
    EXPECT_EQ(dumps.log().find("MARKER-OUTSIDE-THE-RESOURCE-FOLDER"), std::string::npos);
}

// The resolver maps the name after the last '/' into the schema folder of the resource folder, and
// refuses, with a record each, whatever does not name a regular file directly inside it.
TEST_F(Parsing, TheResolverServesOnlyFilesOfTheSchemaFolder) {
    ChartErrorHandler handler;
    const auto resolves = [&](const std::u16string& id) {
        std::unique_ptr<InputSource> source(handler.resolveEntity(nullptr, id.c_str()));
        return source ? utf8(source->getSystemId()) : std::string();
    };
    const std::string file = std::filesystem::canonical(testData("resources/schemas/foundation-test.xsd"));
    for (const char16_t* id :
         {u"http://plotaid.org/test/foundation-test.xsd",
          u"http://elsewhere.example/a/b/c/foundation-test.xsd", u"x/foundation-test.xsd"})
        EXPECT_EQ(resolves(id), file);
    const char16_t* refused[] = {u"foundation-test.xsd",
                                 u"/foundation-test.xsd",
                                 u"http://plotaid.org/test/",
                                 u"http://plotaid.org/test/..",
                                 u"http://plotaid.org/a\\..\\marker.txt",
                                 u"http://plotaid.org/test/missing.xsd",
                                 u"file:///etc/passwd"};
    for (const char16_t* id : refused)
        EXPECT_EQ(resolves(id), "") << utf8(id);
    EXPECT_EQ(handler.resolveEntity(nullptr, nullptr), nullptr);
    const std::string log = dumps.log();
    const std::regex refusal("Error -- ChartXML: resolveEntity refused");
    EXPECT_EQ(std::size_t(std::distance(std::sregex_iterator(log.begin(), log.end(), refusal), {})),
              std::size(refused) + 1);
    EXPECT_NE(log.find("refused 'file:///etc/passwd'"), std::string::npos) << log;

    // Links are followed, and must stay inside the folder; the folder above is not served.
    TempDir root;
    std::filesystem::create_directories(root.file("res/schemas/sub"));
    std::filesystem::create_symlink(testData("marker.txt"), root.file("res/schemas/link.xsd"));
    for (const char* name : {"res/schemas/sub/inner.xsd", "res/schemas/plain.xsd", "res/beside.xsd"})
        std::ofstream(root.file(name)) << "<x/>";
    std::filesystem::create_symlink(root.file("res/schemas/sub/inner.xsd"),
                                    root.file("res/schemas/inner.xsd"));
    ScopedEnv folder("PLOTAID_RESOURCE_DIR", root.file("res"));
    for (const char16_t* id :
         {u"http://x/link.xsd", u"http://x/inner.xsd", u"http://x/sub", u"http://x/beside.xsd"})
        EXPECT_EQ(resolves(id), "") << utf8(id);
    EXPECT_NE(resolves(u"http://x/plain.xsd"), "");
}

// The caller, not the document, chooses the grammar: a schema line is neither needed nor obeyed for
// our kinds, and a document's own declarations do not outlive it.
TEST_F(Parsing, TheCallerChoosesTheGrammarAndNoDocumentLeavesADeclarationBehind) {
    ScopedEnv bundled("PLOTAID_RESOURCE_DIR", std::string(PLOTAID_SOURCE_DIR) + "/resources");
    const std::string bar = withoutSchemaLine(example("charts/simple-bar.xml"));
    const std::string data = withoutSchemaLine(example("data/area.xml"));
    const std::string pmml = example("pmml/credit-risk.xml");
    const std::string claim =
        std::regex_replace(example("charts/pie.xml"), std::regex("2\\.9"), "template-3.5");
    std::string declared = bar, used = bar;
    declared.insert(declared.find("<visualization"), "<!DOCTYPE visualization [<!ENTITY e \"x\">]>");
    used.insert(used.find("</visualization>"), "<label>&e;</label>");
    const struct {
        const std::string& text;
        DocumentKind kind;
        bool valid;
    } rows[] = {{bar, DocumentKind::Chart, true},
                {bar, DocumentKind::Data, true},
                {bar, DocumentKind::Named, false},
                {claim, DocumentKind::Chart, true},
                {bar, DocumentKind::Template, false},
                {data, DocumentKind::Data, true},
                {data, DocumentKind::Chart, false},
                {declared, DocumentKind::Chart, true},
                {used, DocumentKind::Chart, false},
                {pmml, DocumentKind::Pmml, true},
                {withoutSchemaLine(pmml), DocumentKind::TreeDisplay, false}};
    for (const auto& row : rows)
        EXPECT_EQ(parser.parse(row.text, "test", kFailure, row.kind) != nullptr, row.valid)
            << row.text.substr(0, 300);
}

// The grammars of a kind are read for the first parse in a resource folder, and not again for any parser
// on any thread; until Xerces-C stops, which takes them along.
TEST(GrammarPools, EachKindIsReadOncePerFolderForEveryParserOnEveryThread) {
    TempDir dir;
    std::filesystem::create_directory_symlink(std::string(PLOTAID_SOURCE_DIR) + "/resources",
                                              dir.file("res"));
    ScopedEnv fresh("PLOTAID_RESOURCE_DIR", dir.file("res"));
    const DocumentKind kinds[] = {DocumentKind::Chart, DocumentKind::Template, DocumentKind::Data};
    const std::string texts[] = {withoutSchemaLine(example("charts/simple-bar.xml")),
                                 withoutSchemaLine(example("templates/presentation.sgt")),
                                 withoutSchemaLine(example("data/area.xml"))};
    const unsigned base = XercesRuntime::references();
    const unsigned before[] = {ValidatingParser::grammarLoads(kinds[0]),
                               ValidatingParser::grammarLoads(kinds[1]),
                               ValidatingParser::grammarLoads(kinds[2])};
    const auto readAll = [&](int threadCount) {
        XercesRuntime up;
        std::vector<int> valid(threadCount, 0);
        std::vector<std::thread> threads;
        for (int t = 0; t < threadCount; ++t)
            threads.emplace_back([&, t] {
                ValidatingParser parser;
                for (int round = 0; round < 3; ++round)
                    for (int k = 0; k < 3; ++k)
                        valid[t] += parser.parse(texts[k], "test", kFailure, kinds[k]) != nullptr;
            });
        for (std::thread& t : threads)
            t.join();
        EXPECT_EQ(valid, std::vector<int>(threadCount, 9));
    };
    readAll(4);
    for (int k = 0; k < 3; ++k)
        EXPECT_EQ(ValidatingParser::grammarLoads(kinds[k]), before[k] + 1) << k;
    readAll(1);
    EXPECT_EQ(ValidatingParser::grammarLoads(DocumentKind::Chart), before[0] + (base == 0 ? 2 : 1));
}

TEST(XercesRuntimeCount, CopiesAreReferencesAndTheLastOneTerminates) {
    const unsigned base = XercesRuntime::references();
    {
        XercesRuntime first;
        ASSERT_TRUE(first.ready());
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

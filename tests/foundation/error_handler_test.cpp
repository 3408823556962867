#include "foundation/FoundationSupport.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartBase.h>
#include <plotaid/ChartErrorHandler.h>

#include <xercesc/dom/DOMException.hpp>
#include <xercesc/sax/SAXParseException.hpp>
#include <xercesc/util/RuntimeException.hpp>

#include <algorithm>
#include <ctime>
#include <regex>

using namespace foundation_test;
using namespace XERCES_CPP_NAMESPACE;

namespace {

// "Fri Dec  4 19:00:13.042 2026 "
const std::string kStamp =
    R"([A-Z][a-z]{2} [A-Z][a-z]{2} [ 0-9][0-9] [0-9]{2}:[0-9]{2}:[0-9]{2}\.[0-9]{3} [0-9]{4} )";

class ErrorHandler : public ::testing::Test {
protected:
    plotaid::detail::XercesRuntime runtime;
    ChartErrorHandler handler;
};

TEST_F(ErrorHandler, WritesOneRecordWithLocalTimeAndLocationTail) {
    DumpFolder dumps;
    const std::time_t now = std::time(nullptr);
    handler.error(ChartException("parseDocument fatal error while parsing",
                                 "backend/chartxml/plotaid/src/chartbase", 1105));
    handler.warning(ChartException("second", "src/x", 7));
    handler.fatalError(ChartException("first", "", 12)); // without a file text, no tail and no line break
    handler.error(ChartException("next", "f", 1));
    const std::string log = dumps.log();
    EXPECT_TRUE(std::regex_match(
        log, std::regex("^" + kStamp +
                        "Error -- ChartXML: parseDocument fatal error while parsing at file "
                        "backend/chartxml/plotaid/src/chartbase, line 1105, char 0\n" +
                        kStamp + "Warning -- ChartXML: second at file src/x, line 7, char 0\n" + kStamp +
                        "Fatal Error -- ChartXML: first" + kStamp +
                        "Error -- ChartXML: next at file f, line 1, char 0\n$")))
        << log;
    char expected[32];
    std::strftime(expected, sizeof expected, "%a %b", std::localtime(&now));
    EXPECT_EQ(log.substr(0, 7) + log.substr(24, 4),
              expected + std::to_string(1900 + std::localtime(&now)->tm_year));
}

TEST_F(ErrorHandler, NoFolderOrAnUnwritableOneIsSkippedSilently) {
    TempDir dir;
    const RuntimeException xml("here.cpp", 3, XMLExcepts::Gen_NoSchemaValidator);
    {
        ScopedEnv unset("DumpChartXMLPath", nullptr);
        ScopedCwd inside(dir.path());
        handler.error(ChartException("m", "f", 1));
        handler.error(xml);
    }
    EXPECT_TRUE(std::filesystem::is_empty(dir.path()));
    ScopedEnv missing("DumpChartXMLPath", dir.file("no/such/folder"));
    EXPECT_NO_THROW(handler.error(ChartException("m", "f", 1)));
    EXPECT_NO_THROW(handler.warning(xml));
    EXPECT_FALSE(std::filesystem::exists(dir.file("no")));
    // A folder whose log name is taken by a directory cannot be appended to.
    std::filesystem::create_directory(dir.file("chartxml_error.log"));
    ScopedEnv blocked("DumpChartXMLPath", dir.path());
    EXPECT_NO_THROW(handler.fatalError(ChartException("m", "f", 1)));
}

// Parser-facing kinds log, then throw a copy; XML kinds only log. Messages arrive as UTF-16.
TEST_F(ErrorHandler, EachKindLogsUnderItsNameAndOnlyParserKindsThrow) {
    DumpFolder dumps;
    const SAXParseException parse(u"bad \u00e9l\u00e9ment", u"", u"caf\u00e9", 3, 14);
    EXPECT_THROW(handler.warning(parse), SAXParseException);
    EXPECT_THROW(handler.error(parse), SAXParseException);
    try {
        handler.fatalError(parse);
        FAIL() << "fatalError returned";
    } catch (const SAXParseException& e) {
        EXPECT_EQ(e.getLineNumber() * 100 + e.getColumnNumber(), 314u);
    }
    const SAXException sax(u"sax trouble");
    EXPECT_THROW(handler.warning(sax), SAXException);
    EXPECT_THROW(handler.error(sax), SAXException);
    EXPECT_THROW(handler.fatalError(sax), SAXException);
    for (short code : {8, 15, 0, 16}) // the first and last texts, and codes outside the table
        try {
            handler.error(DOMException(code));
            FAIL() << "error returned";
        } catch (const DOMException& e) {
            EXPECT_EQ(e.code, code);
        }
    const RuntimeException xml("some/source.cpp", 77, XMLExcepts::Gen_NoSchemaValidator);
    EXPECT_NO_THROW(handler.warning(xml));
    EXPECT_NO_THROW(handler.error(xml));
    EXPECT_NO_THROW(handler.fatalError(xml));

    const std::string log = dumps.log();
    const std::string text = "bad \xc3\xa9l\xc3\xa9ment at file caf\xc3\xa9, line 3, char 14\n";
    const std::string tail = " at file backend/chartxml/plotaid/src/charterrorhandler, line ";
    const std::string xmlText = R"(.+ at file some/source\.cpp, line 77, char 0\n)";
    for (const std::string kind : {"Warning", "Error", "Fatal Error"}) {
        EXPECT_NE(log.find(kind + " -- SAX Parser: " + text), std::string::npos) << kind << "\n" << log;
        EXPECT_NE(log.find(kind + " -- SAX: sax trouble" + tail + "188, char 0\n"), std::string::npos)
            << kind;
        EXPECT_TRUE(std::regex_search(log, std::regex(" [0-9]{4} " + kind + " -- XML: " + xmlText))) << kind;
    }
    for (const char* dom : {"not found error", "invalid access error", "unknown DOM error"})
        EXPECT_NE(log.find("Error -- DOM: " + (dom + tail) + "253, char 0\n"), std::string::npos) << dom;
}

// The older wording of a data-type failure: the exception name starts at index 21. The same name one
// character off, a shorter text, or the name as a warning or fatal error, is not excused.
TEST_F(ErrorHandler, InvalidDatatypeValueMessageIsIgnored) {
    DumpFolder dumps;
    const SAXParseException datatype(u"Datatype error: Type:InvalidDatatypeValueException, Message:Value 'x'",
                                     u"", u"ChartBase", 1, 1);
    EXPECT_NO_THROW(handler.error(datatype));
    EXPECT_FALSE(dumps.hasLog());
    for (const char16_t* other : {u"Datatype error: Type: InvalidDatatypeValueException", u"Datatype error"})
        EXPECT_THROW(handler.error(SAXParseException(other, u"", u"ChartBase", 1, 1)), SAXParseException);
    EXPECT_THROW(handler.warning(datatype), SAXParseException);
    EXPECT_THROW(handler.fatalError(datatype), SAXParseException);
    EXPECT_NE(dumps.log().find("Warning -- SAX Parser: Datatype error: Type:InvalidDatatypeValueException"),
              std::string::npos);
}

std::vector<int> kindsOn() {
    std::vector<int> on;
    for (int kind = -1; kind <= 12; ++kind)
        if (ChartBase::willPrintString(kind))
            on.push_back(kind);
    return on;
}

// Kind 0 looks only at the first character and is on when the options are empty; 10 is never on;
// all are off without either variable.
TEST(Dumps, OptionsCharactersSwitchKindsAndFilesTakeNameCountExtensionAndTheBytesExactly) {
    const std::pair<const char*, std::vector<int>> cases[] = {
        {"0000110001", {4, 5, 9}},
        {"11111111111111", {0, 1, 2, 3, 4, 5, 6, 7, 8, 9}},
        {"x0y", {0, 2}},
        {"", {0}},
        {"01", {1}}};
    for (const auto& [options, kinds] : cases) {
        DumpFolder folder(options);
        EXPECT_EQ(kindsOn(), kinds) << options;
    }
    {
        DumpFolder noOptions;
        EXPECT_TRUE(kindsOn().empty() && !ChartBase::printString("text", "Template_", ".sgt", 1, 0));
    }
    ScopedEnv noPath("DumpChartXMLPath", nullptr), options("DumpChartXMLOptions", "1111111111");
    EXPECT_TRUE(kindsOn().empty() && !ChartBase::printString("text", "Template_", ".sgt", 1, 4));
    DumpFolder dumps("11111111111111");
    const std::string binary("line\r\nzero\0byte\xff\n", 17);
    EXPECT_TRUE(ChartBase::printString("<before/>", "Xml_before_template_", ".xml", 7,
                                       ChartBase::PRINT_XML_BEFORE_TEMPLATE));
    EXPECT_TRUE(ChartBase::printString("tmpl", "Template_", ".sgt", 123, ChartBase::PRINT_TEMPLATE));
    EXPECT_TRUE(ChartBase::printString("<bad", "parseError_", ".xml", 0, ChartBase::PRINT_XML_WITH_POPUPS));
    EXPECT_TRUE(ChartBase::printString("a longer text, written first", "converted_", ".sgt", 2,
                                       ChartBase::PRINT_CONVERTED_TEMPLATE));
    EXPECT_TRUE(ChartBase::printString(binary, "converted_", ".sgt", 2, ChartBase::PRINT_CONVERTED_TEMPLATE));
    // Nothing to write, or kind 10, or a missing folder: no file and false.
    EXPECT_FALSE(ChartBase::printString("", "Template_", ".sgt", 1, 4));
    EXPECT_FALSE(ChartBase::printString("text", "x", ".xml", 1, 10));
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(dumps.dir().path()))
        names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    EXPECT_EQ(names, (std::vector<std::string>{"Template_123.sgt", "Xml_before_template_07.xml",
                                               "converted_02.sgt", "parseError_00.xml"}));
    EXPECT_EQ(readAll(dumps.dir().file("Xml_before_template_07.xml")), "<before/>");
    EXPECT_EQ(readAll(dumps.dir().file("converted_02.sgt")), binary);
    ScopedEnv missing("DumpChartXMLPath", dumps.dir().file("missing"));
    EXPECT_FALSE(ChartBase::printString("text", "Template_", ".sgt", 1, 4));
}

} // namespace

#include "foundation/FoundationSupport.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartErrorHandler.h>

#include <xercesc/dom/DOMException.hpp>
#include <xercesc/sax/SAXParseException.hpp>
#include <xercesc/util/RuntimeException.hpp>

#include <gtest/gtest.h>

#include <ctime>
#include <regex>
#include <sstream>

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
    // Without a file text, no tail and no line break.
    handler.fatalError(ChartException("first", "", 12));
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
    EXPECT_EQ(log.substr(0, 7), expected);
    EXPECT_EQ(log.substr(24, 4), std::to_string(1900 + std::localtime(&now)->tm_year));
}

TEST_F(ErrorHandler, NoFolderOrAnUnwritableOneIsSkippedSilently) {
    TempDir dir;
    {
        ScopedEnv unset("DumpChartXMLPath", nullptr);
        ScopedCwd inside(dir.path());
        handler.error(ChartException("m", "f", 1));
        handler.error(RuntimeException("here.cpp", 3, XMLExcepts::Gen_NoSchemaValidator));
    }
    EXPECT_TRUE(std::filesystem::is_empty(dir.path()));
    ScopedEnv missing("DumpChartXMLPath", dir.file("no/such/folder"));
    EXPECT_NO_THROW(handler.error(ChartException("m", "f", 1)));
    EXPECT_NO_THROW(handler.warning(RuntimeException("here.cpp", 3, XMLExcepts::Gen_NoSchemaValidator)));
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
        EXPECT_EQ(e.getLineNumber(), 3u);
        EXPECT_EQ(e.getColumnNumber(), 14u);
    }
    const SAXException sax(u"sax trouble");
    EXPECT_THROW(handler.warning(sax), SAXException);
    EXPECT_THROW(handler.error(sax), SAXException);
    EXPECT_THROW(handler.fatalError(sax), SAXException);
    try {
        handler.error(DOMException(DOMException::NOT_FOUND_ERR));
        FAIL() << "error returned";
    } catch (const DOMException& e) {
        EXPECT_EQ(e.code, DOMException::NOT_FOUND_ERR);
    }
    const RuntimeException xml("some/source.cpp", 77, XMLExcepts::Gen_NoSchemaValidator);
    EXPECT_NO_THROW(handler.warning(xml));
    EXPECT_NO_THROW(handler.error(xml));
    EXPECT_NO_THROW(handler.fatalError(xml));

    const std::string log = dumps.log();
    const std::string tail = " at file backend/chartxml/plotaid/src/charterrorhandler, line ";
    const std::string sourceTail = " at file caf\xc3\xa9, line 3, char 14\n";
    for (const std::string& expected : {"Warning -- SAX Parser: bad \xc3\xa9l\xc3\xa9ment" + sourceTail,
                                        "Error -- SAX Parser: bad \xc3\xa9l\xc3\xa9ment" + sourceTail,
                                        "Fatal Error -- SAX Parser: bad \xc3\xa9l\xc3\xa9ment" + sourceTail,
                                        "Warning -- SAX: sax trouble" + tail + "188, char 0\n",
                                        "Error -- SAX: sax trouble" + tail + "188, char 0\n",
                                        "Fatal Error -- SAX: sax trouble" + tail + "188, char 0\n",
                                        "Error -- DOM: not found error" + tail + "253, char 0\n"})
        EXPECT_NE(log.find(expected), std::string::npos) << expected << "\n" << log;
    for (const char* prefix : {"Warning -- XML: ", "Error -- XML: ", "Fatal Error -- XML: "}) {
        const auto at = log.find(prefix);
        ASSERT_NE(at, std::string::npos) << prefix;
        const std::string record = log.substr(at, log.find('\n', at) - at);
        EXPECT_NE(record.find(" at file some/source.cpp, line 77, char 0"), std::string::npos) << record;
        EXPECT_GT(record.find(" at file"), std::string(prefix).size() + 1) << "message missing: " << record;
    }
}

TEST_F(ErrorHandler, DomCodesHaveTheirTexts) {
    DumpFolder dumps;
    for (short code : {1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15, 0, 16})
        EXPECT_THROW(handler.fatalError(DOMException(code)), DOMException);
    std::string texts;
    std::istringstream lines(dumps.log());
    for (std::string line; std::getline(lines, line);) {
        const auto from = line.find("Fatal Error -- DOM: ") + 20;
        texts += line.substr(from, line.find(" at file") - from) + "|";
    }
    EXPECT_EQ(texts, "index size error|DOMString size error|hierarchy request error|wrong document error|"
                     "invalid character error|no data allowed error|no modification allowed error|"
                     "not found error|not supported error|inuse attribute error|invalid state error|"
                     "syntax error|invalid modication error|namespace error|invalid access error|"
                     "unknown DOM error|unknown DOM error|");
}

// The older wording of a data-type failure: the exception name starts at index 21.
TEST_F(ErrorHandler, InvalidDatatypeValueMessageIsIgnored) {
    DumpFolder dumps;
    const SAXParseException datatype(u"Datatype error: Type:InvalidDatatypeValueException, Message:Value 'x'",
                                     u"", u"ChartBase", 1, 1);
    EXPECT_NO_THROW(handler.error(datatype));
    EXPECT_FALSE(dumps.hasLog());
    // The same name one character off, or as a warning or fatal error, is not excused.
    const SAXParseException shifted(u"Datatype error: Type: InvalidDatatypeValueException", u"", u"ChartBase",
                                    1, 1);
    EXPECT_THROW(handler.error(shifted), SAXParseException);
    EXPECT_THROW(handler.warning(datatype), SAXParseException);
    EXPECT_THROW(handler.fatalError(datatype), SAXParseException);
    EXPECT_THROW(handler.error(SAXParseException(u"Datatype error", u"", u"ChartBase", 1, 1)),
                 SAXParseException);
    EXPECT_NE(dumps.log().find("Warning -- SAX Parser: Datatype error: Type:InvalidDatatypeValueException"),
              std::string::npos);
}

} // namespace

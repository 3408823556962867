#include "foundation/FoundationSupport.h"
#include "foundation/XercesRuntime.h"

#include <plotaid/ChartErrorHandler.h>

#include <xercesc/dom/DOMException.hpp>
#include <xercesc/sax/SAXParseException.hpp>
#include <xercesc/util/RuntimeException.hpp>

#include <gtest/gtest.h>

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

TEST_F(ErrorHandler, WritesOneRecordWithTimeAndLocationTail) {
    DumpFolder dumps;
    handler.error(ChartException("parseDocument fatal error while parsing",
                                 "backend/chartxml/plotaid/src/chartbase", 1105));
    handler.warning(ChartException("second", "src/x", 7));
    const std::string log = dumps.log();
    EXPECT_TRUE(std::regex_match(
        log, std::regex("^" + kStamp +
                        "Error -- ChartXML: parseDocument fatal error while parsing at file "
                        "backend/chartxml/plotaid/src/chartbase, line 1105, char 0\n" +
                        kStamp + "Warning -- ChartXML: second at file src/x, line 7, char 0\n$")))
        << log;
}

TEST_F(ErrorHandler, RecordWithoutFileTextHasNoTailAndNoLineBreak) {
    DumpFolder dumps;
    handler.fatalError(ChartException("first", "", 12));
    handler.error(ChartException("next", "f", 1));
    const std::string log = dumps.log();
    EXPECT_TRUE(std::regex_match(log, std::regex("^" + kStamp + "Fatal Error -- ChartXML: first" + kStamp +
                                                 "Error -- ChartXML: next at file f, line 1, char 0\n$")))
        << log;
}

TEST_F(ErrorHandler, TimestampIsTodaysLocalTime) {
    DumpFolder dumps;
    const std::time_t now = std::time(nullptr);
    handler.error(ChartException("m", "f", 1));
    char expected[32];
    std::strftime(expected, sizeof expected, "%a %b", std::localtime(&now));
    const std::string log = dumps.log();
    EXPECT_EQ(log.substr(0, 7), expected);
    EXPECT_EQ(log.substr(24, 4), std::to_string(1900 + std::localtime(&now)->tm_year));
}

TEST_F(ErrorHandler, NothingIsWrittenWithoutDumpFolder) {
    TempDir dir;
    {
        ScopedEnv unset("DumpChartXMLPath", std::nullopt);
        ScopedCwd inside(dir.path());
        handler.error(ChartException("m", "f", 1));
        handler.error(RuntimeException("here.cpp", 3, XMLExcepts::Gen_NoSchemaValidator));
    }
    EXPECT_TRUE(std::filesystem::is_empty(dir.path()));
}

TEST_F(ErrorHandler, MissingOrUnwritableFolderIsSkippedSilently) {
    TempDir dir;
    ScopedEnv missing("DumpChartXMLPath", dir.file("no/such/folder"));
    EXPECT_NO_THROW(handler.error(ChartException("m", "f", 1)));
    EXPECT_NO_THROW(handler.warning(RuntimeException("here.cpp", 3, XMLExcepts::Gen_NoSchemaValidator)));
    EXPECT_FALSE(std::filesystem::exists(dir.file("no")));
    // A folder whose log name is taken by a directory cannot be appended to.
    std::filesystem::create_directory(dir.file("chartxml_error.log"));
    ScopedEnv blocked("DumpChartXMLPath", dir.path());
    EXPECT_NO_THROW(handler.fatalError(ChartException("m", "f", 1)));
}

TEST_F(ErrorHandler, ParserFacingKindsLogThenThrowACopy) {
    DumpFolder dumps;
    const SAXParseException parse(u"bad element", u"", u"ChartBase", 3, 14);
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
    const DOMException dom(DOMException::NOT_FOUND_ERR);
    try {
        handler.error(dom);
        FAIL() << "error returned";
    } catch (const DOMException& e) {
        EXPECT_EQ(e.code, DOMException::NOT_FOUND_ERR);
    }
    const std::string log = dumps.log();
    const std::string tail = " at file backend/chartxml/plotaid/src/charterrorhandler, line ";
    for (const std::string& expected :
         {std::string("Warning -- SAX Parser: bad element at file ChartBase, line 3, char 14\n"),
          std::string("Error -- SAX Parser: bad element at file ChartBase, line 3, char 14\n"),
          std::string("Fatal Error -- SAX Parser: bad element at file ChartBase, line 3, char 14\n"),
          "Warning -- SAX: sax trouble" + tail + "188, char 0\n",
          "Error -- SAX: sax trouble" + tail + "188, char 0\n",
          "Fatal Error -- SAX: sax trouble" + tail + "188, char 0\n",
          "Error -- DOM: not found error" + tail + "253, char 0\n"})
        EXPECT_NE(log.find(expected), std::string::npos) << expected << "\n" << log;
}

TEST_F(ErrorHandler, XmlAndChartKindsOnlyLog) {
    DumpFolder dumps;
    const RuntimeException xml("some/source.cpp", 77, XMLExcepts::Gen_NoSchemaValidator);
    EXPECT_NO_THROW(handler.warning(xml));
    EXPECT_NO_THROW(handler.error(xml));
    EXPECT_NO_THROW(handler.fatalError(xml));
    const std::string log = dumps.log();
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
    const std::string log = dumps.log();
    std::vector<std::string> texts;
    std::istringstream lines(log);
    for (std::string line; std::getline(lines, line);) {
        const auto from = line.find("Fatal Error -- DOM: ") + 20;
        texts.push_back(line.substr(from, line.find(" at file") - from));
    }
    const std::vector<std::string> expected = {"index size error",
                                               "DOMString size error",
                                               "hierarchy request error",
                                               "wrong document error",
                                               "invalid character error",
                                               "no data allowed error",
                                               "no modification allowed error",
                                               "not found error",
                                               "not supported error",
                                               "inuse attribute error",
                                               "invalid state error",
                                               "syntax error",
                                               "invalid modication error",
                                               "namespace error",
                                               "invalid access error",
                                               "unknown DOM error",
                                               "unknown DOM error"};
    EXPECT_EQ(texts, expected);
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
    const SAXParseException shortMessage(u"Datatype error", u"", u"ChartBase", 1, 1);
    EXPECT_THROW(handler.error(shortMessage), SAXParseException);
    const std::string log = dumps.log();
    EXPECT_NE(log.find("Error -- SAX Parser: Datatype error: Type: InvalidDatatypeValueException"),
              std::string::npos);
    EXPECT_NE(log.find("Warning -- SAX Parser: Datatype error: Type:InvalidDatatypeValueException"),
              std::string::npos);
}

TEST_F(ErrorHandler, MessagesArrivingAsUtf16ReachTheLogAsHostText) {
    DumpFolder dumps;
    EXPECT_THROW(
        handler.error(SAXParseException(u"Gr\u00f6\u00dfe \u00fcberschritten", u"", u"caf\u00e9", 2, 5)),
        SAXParseException);
    EXPECT_NE(dumps.log().find("Error -- SAX Parser: Gr\xc3\xb6\xc3\x9f"
                               "e \xc3\xbc"
                               "berschritten at file caf\xc3\xa9"),
              std::string::npos)
        << dumps.log();
}

} // namespace

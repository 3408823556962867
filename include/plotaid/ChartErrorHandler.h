#ifndef PLOTAID_CHARTERRORHANDLER_H
#define PLOTAID_CHARTERRORHANDLER_H

#include <plotaid/ChartException.h>
#include <plotaid/Export.h>

#include <xercesc/sax/HandlerBase.hpp>

XERCES_CPP_NAMESPACE_BEGIN
class DOMException;
class SAXException;
class SAXParseException;
class XMLException;
XERCES_CPP_NAMESPACE_END

// The library's one reporter: the error handler and entity resolver of every parser it runs, and
// the logger of every failure. Each report appends one record to <DumpChartXMLPath>/chartxml_error.log
// when that variable is set; nothing is written otherwise, and a log that cannot be opened is
// skipped. The parser-facing kinds (SAX parse, SAX, DOM) throw a copy of what they were given after
// logging, which is how a parse is stopped; the XML and ChartXML kinds only log, so they may be
// called from catch clauses. The handler has no state: make one per report or per parse.
class PLOTAID_API ChartErrorHandler : public XERCES_CPP_NAMESPACE::HandlerBase {
public:
    ChartErrorHandler() = default;
    ~ChartErrorHandler() override;

    // Maps the file name after the last '/' of the system id into the schema folder of the resource
    // folder (<resource folder>schemas/) and returns a LocalFileInputSource over it (the caller
    // owns it). Anything that does not name an existing file directly inside that folder is
    // refused: logged, and null returned. Install it only on parsers whose own fall-back
    // resolution is disabled, so a refusal fails the parse.
    XERCES_CPP_NAMESPACE::InputSource* resolveEntity(const XMLCh* const publicId,
                                                     const XMLCh* const systemId) override;

    void warning(const XERCES_CPP_NAMESPACE::SAXParseException& e) override;
    // Ignored (no record, no throw) when the message names the invalid-datatype-value exception.
    void error(const XERCES_CPP_NAMESPACE::SAXParseException& e) override;
    void fatalError(const XERCES_CPP_NAMESPACE::SAXParseException& e) override;

    void warning(const XERCES_CPP_NAMESPACE::SAXException& e);
    void error(const XERCES_CPP_NAMESPACE::SAXException& e);
    void fatalError(const XERCES_CPP_NAMESPACE::SAXException& e);

    void warning(const XERCES_CPP_NAMESPACE::DOMException& e);
    void error(const XERCES_CPP_NAMESPACE::DOMException& e);
    void fatalError(const XERCES_CPP_NAMESPACE::DOMException& e);

    void warning(const XERCES_CPP_NAMESPACE::XMLException& e);
    void error(const XERCES_CPP_NAMESPACE::XMLException& e);
    void fatalError(const XERCES_CPP_NAMESPACE::XMLException& e);

    void warning(const ChartException& e);
    void error(const ChartException& e);
    void fatalError(const ChartException& e);

private:
    static void LogMessage(const char* prefix, const std::string& message, const std::string& file,
                           unsigned long long line, unsigned long long column) noexcept;
    static void LogMessage(const char* prefix, const XERCES_CPP_NAMESPACE::SAXParseException& e) noexcept;
    static void LogMessage(const char* prefix, const XERCES_CPP_NAMESPACE::SAXException& e) noexcept;
    static void LogMessage(const char* prefix, const XERCES_CPP_NAMESPACE::DOMException& e) noexcept;
    static void LogMessage(const char* prefix, const XERCES_CPP_NAMESPACE::XMLException& e) noexcept;
    static void LogMessage(const char* prefix, const ChartException& e) noexcept;
};

#endif

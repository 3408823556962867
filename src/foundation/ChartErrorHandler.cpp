#include <plotaid/ChartErrorHandler.h>

#include "foundation/HostText.h"
#include "foundation/RecordSink.h"

#include <scratchloc/PathFactory.h>

#include <xercesc/dom/DOMException.hpp>
#include <xercesc/framework/LocalFileInputSource.hpp>
#include <xercesc/sax/SAXParseException.hpp>
#include <xercesc/util/XMLException.hpp>
#include <xercesc/util/XMLString.hpp>
#include <xercesc/util/XMLUni.hpp>
#include <xercesc/util/XMLUniDefs.hpp>

#include <chrono>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <memory>
#include <sys/stat.h>

using namespace XERCES_CPP_NAMESPACE;
using plotaid::detail::toHost;
using plotaid::detail::toWide;
using plotaid::detail::WideText;

namespace {

const char* const kHandlerFile = "backend/chartxml/plotaid/src/charterrorhandler";
constexpr unsigned kSaxLine = 188;
constexpr unsigned kDomLine = 253;
constexpr unsigned kResolveLine = 300;
// Schemas and document type definitions sit in this folder of the resource folder.
const char* const kSchemaFolder = "schemas/";

const char* domCodeText(int code) {
    switch (code) {
    case 1:
        return "index size error";
    case 2:
        return "DOMString size error";
    case 3:
        return "hierarchy request error";
    case 4:
        return "wrong document error";
    case 5:
        return "invalid character error";
    case 6:
        return "no data allowed error";
    case 7:
        return "no modification allowed error";
    case 8:
        return "not found error";
    case 9:
        return "not supported error";
    case 10:
        return "inuse attribute error";
    case 11:
        return "invalid state error";
    case 12:
        return "syntax error";
    case 13:
        return "invalid modication error";
    case 14:
        return "namespace error";
    case 15:
        return "invalid access error";
    default:
        return "unknown DOM error";
    }
}

// The Xerces-C 2 wording of a data-type failure put the exception name right after
// "Datatype error: Type:", 21 characters in.
bool namesInvalidDatatypeValue(const XMLCh* message) {
    constexpr XMLSize_t kNameAt = 21;
    constexpr XMLSize_t kNameLength = 29;
    if (message == nullptr || XMLString::stringLen(message) < kNameAt)
        return false;
    return XMLString::compareNString(message + kNameAt, XMLUni::fgInvalidDatatypeValueException_Name,
                                     kNameLength) == 0;
}

// "Fri Dec  4 19:00:13.042 2026": ctime's text with the milliseconds put in before the year.
std::string timestamp() {
    const auto now = std::chrono::system_clock::now();
    const std::time_t seconds = std::chrono::system_clock::to_time_t(now);
    const long long millis =
        std::chrono::duration_cast<std::chrono::milliseconds>(now.time_since_epoch()).count() % 1000;
    char text[64] = {};
    if (::ctime_r(&seconds, text) == nullptr || std::char_traits<char>::length(text) < 24)
        return std::string();
    char milliText[8];
    std::snprintf(milliText, sizeof milliText, ".%03lld", millis < 0 ? 0 : millis);
    return std::string(text, 19) + milliText + std::string(text + 19, 5);
}

// A system id is hostile text; keep a record on one line whatever it holds.
std::string printable(std::string text) {
    for (char& c : text)
        if (static_cast<unsigned char>(c) < 0x20 || c == 0x7f)
            c = '?';
    return text;
}

bool isResourceFileName(const XMLCh* name) {
    if (name == nullptr || *name == 0 || *name == u'.')
        return false;
    for (const XMLCh* c = name; *c; ++c) {
        const bool ok = (*c >= u'a' && *c <= u'z') || (*c >= u'A' && *c <= u'Z') ||
                        (*c >= u'0' && *c <= u'9') || *c == u'.' || *c == u'-' || *c == u'_';
        if (!ok)
            return false;
    }
    return true;
}

std::string canonical(const std::string& path) {
    char resolved[PATH_MAX];
    return ::realpath(path.c_str(), resolved) ? std::string(resolved) : std::string();
}

// The canonical path of the named file when it is a regular file directly inside the schema folder
// of the resource folder (symbolic links followed, and the target still there); empty otherwise.
std::string resourceFile(const XMLCh* name) {
    const scratchloc::PathFinder* finder =
        scratchloc::PathFactory::getPathInstance(scratchloc::PathFactory::ResourceFolder);
    if (finder == nullptr || !isResourceFileName(name))
        return std::string();
    const std::string schemas = finder->getPath() + kSchemaFolder;
    const std::string folder = canonical(schemas);
    if (folder.empty())
        return std::string();
    const std::string file = canonical(schemas + toHost(name));
    struct stat st {};
    if (file.size() <= folder.size() + 1 || file.compare(0, folder.size(), folder) != 0 ||
        file[folder.size()] != '/' || file.find('/', folder.size() + 1) != std::string::npos ||
        ::stat(file.c_str(), &st) != 0 || !S_ISREG(st.st_mode))
        return std::string();
    return file;
}

} // namespace

ChartErrorHandler::~ChartErrorHandler() = default;

InputSource* ChartErrorHandler::resolveEntity(const XMLCh* const publicId, const XMLCh* const systemId) {
    (void)publicId;
    const int slash = systemId ? XMLString::lastIndexOf(systemId, chForwardSlash) : -1;
    const std::string file = slash > 0 ? resourceFile(systemId + slash + 1) : std::string();
    const WideText path = file.empty() ? WideText() : toWide(file.c_str());
    if (!path) {
        LogMessage("Error -- ChartXML:",
                   "resolveEntity refused '" + printable(toHost(systemId)) +
                       "': not a file of the resource folder",
                   kHandlerFile, kResolveLine, 0);
        return nullptr;
    }
    try {
        return new LocalFileInputSource(path.get());
    } catch (const XMLException& e) {
        LogMessage("Error -- XML:", e);
        return nullptr;
    }
}

void ChartErrorHandler::warning(const SAXParseException& e) {
    LogMessage("Warning -- SAX Parser:", e);
    throw SAXParseException(e);
}

void ChartErrorHandler::error(const SAXParseException& e) {
    if (namesInvalidDatatypeValue(e.getMessage()))
        return;
    LogMessage("Error -- SAX Parser:", e);
    throw SAXParseException(e);
}

void ChartErrorHandler::fatalError(const SAXParseException& e) {
    LogMessage("Fatal Error -- SAX Parser:", e);
    throw SAXParseException(e);
}

void ChartErrorHandler::warning(const SAXException& e) {
    LogMessage("Warning -- SAX:", e);
    throw SAXException(e);
}

void ChartErrorHandler::error(const SAXException& e) {
    LogMessage("Error -- SAX:", e);
    throw SAXException(e);
}

void ChartErrorHandler::fatalError(const SAXException& e) {
    LogMessage("Fatal Error -- SAX:", e);
    throw SAXException(e);
}

void ChartErrorHandler::warning(const DOMException& e) {
    LogMessage("Warning -- DOM:", e);
    throw DOMException(e);
}

void ChartErrorHandler::error(const DOMException& e) {
    LogMessage("Error -- DOM:", e);
    throw DOMException(e);
}

void ChartErrorHandler::fatalError(const DOMException& e) {
    LogMessage("Fatal Error -- DOM:", e);
    throw DOMException(e);
}

void ChartErrorHandler::warning(const XMLException& e) {
    LogMessage("Warning -- XML:", e);
}
void ChartErrorHandler::error(const XMLException& e) {
    LogMessage("Error -- XML:", e);
}
void ChartErrorHandler::fatalError(const XMLException& e) {
    LogMessage("Fatal Error -- XML:", e);
}

void ChartErrorHandler::warning(const ChartException& e) {
    LogMessage("Warning -- ChartXML:", e);
}
void ChartErrorHandler::error(const ChartException& e) {
    LogMessage("Error -- ChartXML:", e);
}
void ChartErrorHandler::fatalError(const ChartException& e) {
    LogMessage("Fatal Error -- ChartXML:", e);
}

void ChartErrorHandler::LogMessage(const char* prefix, const std::string& message, const std::string& file,
                                   unsigned long long line, unsigned long long column) noexcept {
    plotaid::detail::RecordCollector::deliver(prefix, message);
    const char* folder = std::getenv("DumpChartXMLPath");
    if (folder == nullptr)
        return;
    try {
        std::string record = timestamp() + " " + prefix + " " + message;
        if (!file.empty())
            record += " at file " + file + ", line " + std::to_string(line) + ", char " +
                      std::to_string(column) + "\n";
        const std::string path = std::string(folder) + "/chartxml_error.log";
        std::FILE* log = std::fopen(path.c_str(), "a");
        if (log == nullptr)
            return;
        std::fwrite(record.data(), 1, record.size(), log);
        std::fclose(log);
    } catch (...) {
        // Reporting never fails the operation that reports.
    }
}

void ChartErrorHandler::LogMessage(const char* prefix, const SAXParseException& e) noexcept {
    try {
        LogMessage(prefix, toHost(e.getMessage()), toHost(e.getSystemId()), e.getLineNumber(),
                   e.getColumnNumber());
    } catch (...) {
    }
}

void ChartErrorHandler::LogMessage(const char* prefix, const SAXException& e) noexcept {
    try {
        LogMessage(prefix, toHost(e.getMessage()), kHandlerFile, kSaxLine, 0);
    } catch (...) {
    }
}

void ChartErrorHandler::LogMessage(const char* prefix, const DOMException& e) noexcept {
    try {
        LogMessage(prefix, domCodeText(static_cast<int>(e.code)), kHandlerFile, kDomLine, 0);
    } catch (...) {
    }
}

void ChartErrorHandler::LogMessage(const char* prefix, const XMLException& e) noexcept {
    try {
        LogMessage(prefix, toHost(e.getMessage()), e.getSrcFile() ? e.getSrcFile() : "", e.getSrcLine(), 0);
    } catch (...) {
    }
}

void ChartErrorHandler::LogMessage(const char* prefix, const ChartException& e) noexcept {
    try {
        LogMessage(prefix, e.what(), e.file(), e.line(), 0);
    } catch (...) {
    }
}

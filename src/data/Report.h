#ifndef PLOTAID_DATA_REPORT_H
#define PLOTAID_DATA_REPORT_H

#include <string>

namespace plotaid::detail {

// Source-file texts of the data classes, as the error log names them.
inline constexpr const char* kVarDataFile = "backend/chartxml/plotaid/src/vardataprocessor";
inline constexpr const char* kXmlDataFile = "backend/chartxml/plotaid/src/xmldatahandler";

// Logs one error record; never throws, never fails the caller.
void reportDataError(const std::string& message, const char* file, unsigned line) noexcept;

} // namespace plotaid::detail

#endif

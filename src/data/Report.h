#ifndef PLOTAID_DATA_REPORT_H
#define PLOTAID_DATA_REPORT_H

#include "foundation/Report.h"

namespace plotaid::detail {

// Source-file texts of the data classes, as the error log names them.
inline constexpr const char* kVarDataFile = "backend/chartxml/plotaid/src/vardataprocessor";
inline constexpr const char* kXmlDataFile = "backend/chartxml/plotaid/src/xmldatahandler";

} // namespace plotaid::detail

#endif

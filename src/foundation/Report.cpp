#include "foundation/Report.h"

#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>

namespace plotaid::detail {

void reportFailure(const std::string& message, const char* file, unsigned line) noexcept {
    try {
        ChartErrorHandler().error(ChartException(message, file, line));
    } catch (...) {
        // Reporting never fails the operation that reports.
    }
}

} // namespace plotaid::detail

#include "data/Report.h"

#include <plotaid/ChartException.h>

#if __has_include(<plotaid/ChartErrorHandler.h>)
#include <plotaid/ChartErrorHandler.h>
#define PLOTAID_DATA_HAVE_HANDLER 1
#endif

namespace plotaid::detail {

void reportDataError(const std::string& message, const char* file, unsigned line) noexcept {
    try {
        ChartException e(message, file, line);
#ifdef PLOTAID_DATA_HAVE_HANDLER
        ChartErrorHandler handler;
        handler.error(e);
#else
        (void)e;
#endif
    } catch (...) {
        // Reporting never fails the operation that reports.
    }
}

} // namespace plotaid::detail

#include <plotaid/ChartBase.h>
#include <plotaid/TimeStamp.h>

#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <memory>

namespace plotaid::detail {
namespace {

// "/chartxmldebug_" with the month as ctime writes it and the blank-padded day: "Dec  4" gives
// "chartxmldebug_Dec 4". ctime's names are English whatever the locale, so no strftime here.
std::string timingLogBase(const char* folder) {
    static const char* const kMonths[] = {"Jan", "Feb", "Mar", "Apr", "May", "Jun",
                                          "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"};
    const std::time_t now = std::time(nullptr);
    std::tm local{};
    if (!localtime_r(&now, &local))
        return std::string(folder) + "/chartxmldebug_";
    char day[8];
    std::snprintf(day, sizeof day, "%2d", local.tm_mday);
    return std::string(folder) + "/chartxmldebug_" + kMonths[local.tm_mon % 12] + day;
}

} // namespace
} // namespace plotaid::detail

void ChartBase::printDebugInfo(const std::string& text) {
    try {
        const char* folder = std::getenv("DumpChartTimePath");
        if (!folder)
            return;
        // Created on first use and kept for the process, even across midnight.
        static TimeStamp log(plotaid::detail::timingLogBase(folder), 0);
        log.logTime("", text);
    } catch (...) {
        // Timing is debug output: never let it disturb the host.
    }
}

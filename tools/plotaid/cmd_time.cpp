// plotaid time: the host's time value of an ISO date or time text, with the calendar date or
// clock time it stands for, so a conversion can be checked by eye.
#include "Command.h"

#include <plotaid/TimeConverter.h>

#include <cmath>
#include <cstdint>
#include <cstdio>
#include <limits>
#include <string>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "time";

void printHelp() {
    std::printf("usage: plotaid time date TEXT\n"
                "       plotaid time time TEXT\n\n"
                "date  TEXT is YEAR-MONTH-DAY, optionally followed by a blank and a time; prints the\n"
                "      host's time value (seconds since 14 October 1582) and the date it stands for.\n"
                "      Day 0 is the last day of the previous month, month 13 January of the next year.\n"
                "time  TEXT is HOURS:MINUTES[:SECONDS[.FRACTION]] (\",\" also separates the fraction);\n"
                "      prints the seconds it counts.\n"
                "Exit status: 0 on success, 1 when the date gives the missing value, 2 on a usage error.\n");
}

// Civil date of a day count from 14 October 1582, by 400-year eras (independent of the converter).
void civilDate(std::int64_t daysFromStart, std::int64_t& year, unsigned& month, unsigned& day) {
    std::int64_t z = daysFromStart - 141428 + 719468; // via 1970-01-01
    const std::int64_t era = (z >= 0 ? z : z - 146096) / 146097;
    const std::int64_t doe = z - era * 146097;
    const std::int64_t yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
    const std::int64_t doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
    const std::int64_t mp = (5 * doy + 2) / 153;
    day = static_cast<unsigned>(doy - (153 * mp + 2) / 5 + 1);
    month = static_cast<unsigned>(mp < 10 ? mp + 3 : mp - 9);
    year = yoe + era * 400 + (month <= 2);
}

std::string clock(double seconds, bool wrapDay) {
    double whole = std::floor(seconds);
    unsigned millis = static_cast<unsigned>(std::lround((seconds - whole) * 1000.0));
    if (millis == 1000) {
        whole += 1;
        millis = 0;
    }
    const auto total = static_cast<long long>(whole);
    const long long hours = wrapDay ? total / 3600 % 24 : total / 3600;
    char buf[64];
    std::snprintf(buf, sizeof buf, "%02lld:%02lld:%02lld", hours, total / 60 % 60, total % 60);
    std::string text = buf;
    if (millis) {
        std::snprintf(buf, sizeof buf, ".%03u", millis);
        text += buf;
    }
    return text;
}

int showDate(const std::string& text) {
    const double value = TimeConverter::convertDateFromISOFormatToKovarDouble(text);
    if (value == -std::numeric_limits<double>::max()) {
        std::printf("host value: missing\n");
        std::fflush(stdout);
        return failure(kName, "'" + text + "' is not a date from 14 October 1582 on");
    }
    const double days = std::floor(value / 86400.0);
    std::int64_t year = 0;
    unsigned month = 0, day = 0;
    civilDate(static_cast<std::int64_t>(days), year, month, day);
    std::printf("host value: %.15g\n", value);
    std::printf("date:       %04lld-%02u-%02u %s\n", static_cast<long long>(year), month, day,
                clock(value - days * 86400.0, true).c_str());
    std::printf("days since 1582-10-14: %.0f\n", days);
    return kOk;
}

int showTime(const std::string& text) {
    const double value = TimeConverter::convertTimeFromISOFormatToKovarDouble(text);
    std::printf("host value: %.15g\n", value);
    std::printf("time:       %s\n", clock(value, false).c_str());
    return kOk;
}

int run(const Args& args) {
    if (wantsHelp(args)) {
        printHelp();
        return kOk;
    }
    if (args.size() != 2)
        return usageError(kName,
                          args.empty() ? "no conversion given" : "expected 'date TEXT' or 'time TEXT'");
    if (args[0] == "date")
        return showDate(args[1]);
    if (args[0] == "time")
        return showTime(args[1]);
    return usageError(kName, "unknown conversion '" + args[0] + "'");
}

const Registrar registrar({kName, "host time values of ISO date and time texts", run});

} // namespace
} // namespace plotaid::tool

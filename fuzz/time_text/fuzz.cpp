// Bytes as date and time texts: every result is the missing value or a time from the start of the
// calendar on (dates), or a finite, non-negative count of seconds (times); never a crash.
#include <plotaid/TimeConverter.h>

#include <cmath>
#include <cstddef>
#include <cstdint>
#include <limits>
#include <string>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text(reinterpret_cast<const char*>(data), size);
    const double missing = -std::numeric_limits<double>::max();

    const double date = TimeConverter::convertDateFromISOFormatToKovarDouble(text);
    if (date != missing && !(std::isfinite(date) && date >= 0.0))
        __builtin_trap();

    const double time = TimeConverter::convertTimeFromISOFormatToKovarDouble(text);
    if (!std::isfinite(time) || time < 0.0)
        __builtin_trap();

    // A number text is its own value modulo 2^32, or 0.
    const unsigned n = TimeConverter::convertStringToUnsignedInt(text);
    if (text.empty() && n != 0)
        __builtin_trap();
    return 0;
}

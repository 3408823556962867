#include <grx/formatter.h>

#include <charconv>
#include <cmath>

namespace formatter {

std::string AsString(double value, int digits) {
    if (std::isnan(value))
        return "nan";
    if (value == 0.0)
        return "0"; // also -0.0
    char buf[64];
    std::to_chars_result r;
    if (digits >= 1 && digits <= 17)
        r = std::to_chars(buf, buf + sizeof buf, value, std::chars_format::general, digits);
    else
        r = std::to_chars(buf, buf + sizeof buf, value);
    if (r.ec != std::errc())
        return std::string();
    return std::string(buf, r.ptr);
}

} // namespace formatter

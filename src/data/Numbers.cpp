#include "data/Numbers.h"

#include "data/StoreAccess.h"

#include <grx/formatter.h>

#include <charconv>
#include <clocale>
#include <cmath>
#include <cstdlib>
#include <locale.h>
#include <string>

namespace plotaid::detail {

namespace {

bool isBlank(char c) {
    return c == ' ' || c == '\t' || c == '\n' || c == '\v' || c == '\f' || c == '\r';
}

// The "C" locale as an object of its own: strtod_l reads '.' without touching the process locale.
locale_t cLocale() {
    static const locale_t c = newlocale(LC_ALL_MASK, "C", locale_t(0));
    return c;
}

// Only for what from_chars leaves open: hexadecimal and out-of-range numbers.
double slowParse(const char* first, const char* last, const char*& end) {
    const std::string text(first, last);
    char* stop = nullptr;
    const locale_t c = cLocale();
    const double value = c ? strtod_l(text.c_str(), &stop, c) : 0.0;
    end = c ? first + (stop - text.c_str()) : first;
    return value;
}

} // namespace

void appendCell(std::string& out, double value) {
    if (value == kMissingValue)
        return;
    if (value >= -2147483648.0 && value <= 2147483647.0) {
        const int whole = static_cast<int>(value);
        if (static_cast<double>(whole) == value) {
            char buf[16];
            const auto r = std::to_chars(buf, buf + sizeof buf, whole);
            out.append(buf, r.ptr);
            return;
        }
    }
    out += formatter::AsString(value, 16);
}

std::string formatCell(double value) {
    std::string text;
    appendCell(text, value);
    return text;
}

bool parseNumber(const char* first, const char* last, double& value) {
    value = 0;
    const char* p = first;
    while (p < last && isBlank(*p))
        ++p;
    const char* number = p;
    bool negative = false;
    if (p < last && (*p == '+' || *p == '-')) {
        negative = *p == '-';
        ++p;
    }
    if (p == last || *p == '+' || *p == '-')
        return false;
    const char* end = number;
    double v = 0;
    if (last - p >= 2 && p[0] == '0' && (p[1] == 'x' || p[1] == 'X')) {
        v = slowParse(number, last, end);
        negative = false; // strtod saw the sign
    } else {
        const auto r = std::from_chars(p, last, v);
        if (r.ec == std::errc())
            end = r.ptr;
        else if (r.ec == std::errc::result_out_of_range) {
            v = slowParse(number, last, end);
            negative = false;
        } else
            return false;
    }
    value = negative ? -v : v;
    while (end < last && isBlank(*end))
        ++end;
    return end == last && end != number;
}

} // namespace plotaid::detail

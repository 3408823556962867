#include <kovar/kovarconv.h>

#include <array>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstdio>

namespace kovar {

namespace {

customCurrency defaultCurrency() {
    return customCurrency{"", "", "-", "", "."};
}

std::array<customCurrency, currencyFormat::kCount>& currencies() {
    static std::array<customCurrency, currencyFormat::kCount> all = {
        defaultCurrency(), defaultCurrency(), defaultCurrency(), defaultCurrency(), defaultCurrency()};
    return all;
}

// Digits of |value| with the given decimals, halves rounded away from zero as the host prints
// them (42.25 to one decimal is 42.3). Rounding works on the shortest exact decimal text, so a
// binary tie is not taken to the even neighbour; to_chars keeps the process locale out of it.
std::string plainDigits(double value, int decimals, bool scientific) {
    char buf[512];
    const double magnitude = std::fabs(value);
    if (scientific) {
        const auto r =
            std::to_chars(buf, buf + sizeof buf, magnitude, std::chars_format::scientific, decimals);
        return r.ec == std::errc() ? std::string(buf, r.ptr) : std::string();
    }
    const auto r = std::to_chars(buf, buf + sizeof buf, magnitude, std::chars_format::fixed);
    if (r.ec != std::errc())
        return std::string();
    std::string digits(buf, r.ptr);
    std::size_t point = digits.find('.');
    if (point == std::string::npos) {
        point = digits.size();
        digits += '.';
    }
    std::string fraction = digits.substr(point + 1);
    std::string whole = digits.substr(0, point);
    const std::size_t keep = static_cast<std::size_t>(decimals);
    const bool roundUp = fraction.size() > keep && fraction[keep] >= '5';
    fraction.resize(keep, '0');
    std::string kept = whole + fraction;
    if (roundUp) {
        std::size_t i = kept.size();
        while (i > 0 && kept[i - 1] == '9')
            kept[--i] = '0';
        if (i == 0)
            kept.insert(0, 1, '1');
        else
            ++kept[i - 1];
    }
    const std::size_t wholeDigits = kept.size() - keep;
    return keep == 0 ? kept : kept.substr(0, wholeDigits) + "." + kept.substr(wholeDigits);
}

std::string grouped(std::string digits, char point, char group) {
    std::size_t end = digits.find('.');
    if (end == std::string::npos)
        end = digits.size();
    else
        digits[end] = point;
    if (group)
        for (std::size_t i = end; i > 3; i -= 3)
            digits.insert(i - 3, 1, group);
    return digits;
}

struct Civil {
    std::int64_t year;
    unsigned month, day;
};

// Civil date of a day count since 1970-01-01 (proleptic Gregorian).
Civil civilFromDays(std::int64_t z) {
    z += 719468;
    const std::int64_t era = (z >= 0 ? z : z - 146096) / 146097;
    const std::int64_t doe = z - era * 146097;
    const std::int64_t yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
    const std::int64_t doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
    const std::int64_t mp = (5 * doy + 2) / 153;
    const unsigned d = static_cast<unsigned>(doy - (153 * mp + 2) / 5 + 1);
    const unsigned m = static_cast<unsigned>(mp < 10 ? mp + 3 : mp - 9);
    return Civil{yoe + era * 400 + (m <= 2), m, d};
}

// Days from 1970-01-01 to 14 October 1582, the host's day 0.
constexpr std::int64_t kHostEpochDays = -141428;

const char* const kMonths[] = {"JAN", "FEB", "MAR", "APR", "MAY", "JUN",
                               "JUL", "AUG", "SEP", "OCT", "NOV", "DEC"};

std::string dateText(double seconds, int type) {
    if (!std::isfinite(seconds) || std::fabs(seconds) > 1e15)
        return std::string();
    const double dayCount = std::floor(seconds / 86400.0);
    const Civil c = civilFromDays(static_cast<std::int64_t>(dayCount) + kHostEpochDays);
    const long secondOfDay = static_cast<long>(seconds - dayCount * 86400.0);
    char buf[64];
    switch (type) {
    case 20:
        std::snprintf(buf, sizeof buf, "%02u-%s-%04lld", c.day, kMonths[c.month - 1],
                      static_cast<long long>(c.year));
        break;
    case 22:
        std::snprintf(buf, sizeof buf, "%02u-%s-%04lld %02ld:%02ld:%02ld", c.day, kMonths[c.month - 1],
                      static_cast<long long>(c.year), secondOfDay / 3600, secondOfDay / 60 % 60,
                      secondOfDay % 60);
        break;
    case 23:
        std::snprintf(buf, sizeof buf, "%02u/%02u/%04lld", c.month, c.day, static_cast<long long>(c.year));
        break;
    case 38:
        std::snprintf(buf, sizeof buf, "%02u.%02u.%04lld", c.day, c.month, static_cast<long long>(c.year));
        break;
    case 39:
        std::snprintf(buf, sizeof buf, "%04lld/%02u/%02u", static_cast<long long>(c.year), c.month, c.day);
        break;
    default:
        std::snprintf(buf, sizeof buf, "%04lld-%02u-%02u", static_cast<long long>(c.year), c.month, c.day);
        break;
    }
    return buf;
}

std::string durationText(double seconds, bool withDays) {
    if (!std::isfinite(seconds) || std::fabs(seconds) > 1e15)
        return std::string();
    const long long total = static_cast<long long>(std::fabs(seconds));
    char buf[64];
    if (withDays)
        std::snprintf(buf, sizeof buf, "%s%lld %02lld:%02lld:%02lld", seconds < 0 ? "-" : "", total / 86400,
                      total / 3600 % 24, total / 60 % 60, total % 60);
    else
        std::snprintf(buf, sizeof buf, "%s%lld:%02lld:%02lld", seconds < 0 ? "-" : "", total / 3600,
                      total / 60 % 60, total % 60);
    return buf;
}

std::string numberText(double value, const Kovar_Format& format) {
    const int type = format.GetType();
    const int decimals = format.GetDecimals() > 16 ? 16 : format.GetDecimals();
    const bool negative = value < 0;
    const std::string sign = negative ? "-" : "";
    switch (type) {
    case 3:
        return sign + grouped(plainDigits(value, decimals, false), '.', ',');
    case 4:
        return sign + "$" + grouped(plainDigits(value, decimals, false), '.', ',');
    case 17:
        return sign + plainDigits(value, decimals, true);
    case 31:
        return sign + grouped(plainDigits(value, decimals, false), '.', 0) + "%";
    case 32:
        return sign + grouped(plainDigits(value, decimals, false), ',', '.');
    case 33:
    case 34:
    case 35:
    case 36:
    case 37: {
        const customCurrency cc = currencyFormat().GetCCX(type - 33);
        const char point = cc.decimalIndicator == "." ? '.' : ',';
        const std::string body =
            grouped(plainDigits(value, decimals, false), point, point == '.' ? ',' : '.');
        return negative ? cc.negativePrefix + cc.prefix + body + cc.suffix + cc.negativeSuffix
                        : cc.prefix + body + cc.suffix;
    }
    case 21:
        return durationText(value, false);
    case 25:
        return durationText(value, true);
    default:
        if ((type >= 20 && type <= 30) || type == 38 || type == 39)
            return dateText(value, type);
        return sign + grouped(plainDigits(value, decimals, false), '.', 0);
    }
}

} // namespace

customCurrency currencyFormat::GetCCX(int index) const {
    if (index < 0 || index >= kCount)
        return defaultCurrency();
    return currencies()[static_cast<std::size_t>(index)];
}

void currencyFormat::SetCCX(int index, const customCurrency& currency) {
    if (index >= 0 && index < kCount)
        currencies()[static_cast<std::size_t>(index)] = currency;
}

void currencyFormat::ResetCCX() {
    currencies().fill(defaultCurrency());
}

void ToString(double value, const Kovar_Format& format, std::string& buffer) {
    const std::size_t width = format.GetWidth();
    std::string text = (value == kMissingValue || !std::isfinite(value)) ? "." : numberText(value, format);
    if (text.empty() || text.size() > width)
        text.assign(width, '*');
    buffer.assign(width - text.size(), ' ');
    buffer += text;
}

} // namespace kovar

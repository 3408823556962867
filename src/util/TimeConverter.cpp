#include <plotaid/TimeConverter.h>

#include <cstdint>
#include <limits>

namespace {

constexpr double kMissing = -std::numeric_limits<double>::max();

constexpr unsigned kFirstYear = 1582;
constexpr unsigned kLastYear = 5867441;

bool isGregorianLeap(unsigned year) {
    return (year % 4 == 0 && year % 100 != 0) || year % 400 == 0;
}

// Fraction digits as a decimal fraction, so ".5" is half a second and ".250" a quarter. Digits
// beyond the 17th cannot change a double; anything but digits reads as 0.
double readFraction(const std::string& digits) {
    std::uint64_t value = 0;
    double scale = 1.0;
    int used = 0;
    for (char c : digits) {
        if (c < '0' || c > '9')
            return 0.0;
        if (used < 17) {
            value = value * 10 + static_cast<unsigned>(c - '0');
            scale *= 10.0;
            ++used;
        }
    }
    return used == 0 ? 0.0 : static_cast<double>(value) / scale;
}

} // namespace

double TimeConverter::ConvertYearMonthDayToSecs(unsigned year, unsigned month, unsigned day) {
    if (year < kFirstYear || year > kLastYear || month < 1 || month > 13 || day > 31)
        return kMissing;
    // Signed 64 bits: identical to the 32-bit unsigned sum over the accepted range, but a day
    // before 14 October 1582 comes out negative instead of wrapping to a huge positive count.
    const std::int64_t y = year;
    const std::int64_t m = month;
    std::int64_t days = y * 365 + (y + 3) / 4 + static_cast<std::int64_t>(day) + (m + 2) * 3055 / 100 -
                        (y + 99) / 100 + (y + 399) / 400 - 578192;
    if (month > 2) {
        days -= 2;
        if (isGregorianLeap(year))
            days += 1;
    }
    if (days < 0)
        return kMissing;
    return static_cast<double>(days) * 86400.0;
}

unsigned TimeConverter::convertStringToUnsignedInt(const std::string& text) {
    std::uint32_t value = 0;
    for (char c : text) {
        if (c < '0' || c > '9')
            return 0;
        value = value * 10u + static_cast<std::uint32_t>(c - '0');
    }
    return value;
}

double TimeConverter::convertTimeFromISOFormatToKovarDouble(const std::string& text) {
    const std::size_t p1 = text.find(':');
    if (p1 == std::string::npos)
        return 0.0;
    // In double, so a long duration cannot wrap to a short one.
    const double hours = convertStringToUnsignedInt(text.substr(0, p1));
    const std::size_t p2 = text.find(':', p1 + 1);
    if (p2 == std::string::npos) {
        const double minutes = convertStringToUnsignedInt(text.substr(p1 + 1));
        return hours * 3600.0 + minutes * 60.0;
    }
    const double minutes = convertStringToUnsignedInt(text.substr(p1 + 1, p2 - p1 - 1));
    std::size_t p3 = text.find('.', p2 + 1);
    if (p3 == std::string::npos)
        p3 = text.find(',', p2 + 1);
    if (p3 == std::string::npos) {
        const double seconds = convertStringToUnsignedInt(text.substr(p2 + 1));
        return hours * 3600.0 + minutes * 60.0 + seconds;
    }
    const double seconds = convertStringToUnsignedInt(text.substr(p2 + 1, p3 - p2 - 1));
    return hours * 3600.0 + minutes * 60.0 + seconds + readFraction(text.substr(p3 + 1));
}

double TimeConverter::convertDateFromISOFormatToKovarDouble(const std::string& text) {
    const std::size_t p1 = text.find('-');
    if (p1 == std::string::npos)
        return ConvertYearMonthDayToSecs(0, 0, 0);
    const unsigned year = convertStringToUnsignedInt(text.substr(0, p1));
    const std::size_t p2 = text.find('-', p1 + 1);
    if (p2 == std::string::npos)
        return ConvertYearMonthDayToSecs(year, 0, 0);
    const unsigned month = convertStringToUnsignedInt(text.substr(p1 + 1, p2 - p1 - 1));
    const std::size_t p3 = text.find(' ', p2 + 1);
    unsigned day = 0;
    double time = 0.0;
    if (p3 == std::string::npos) {
        day = convertStringToUnsignedInt(text.substr(p2 + 1));
    } else {
        day = convertStringToUnsignedInt(text.substr(p2 + 1, p3 - p2 - 1));
        time = convertTimeFromISOFormatToKovarDouble(text.substr(p3 + 1));
    }
    const double date = ConvertYearMonthDayToSecs(year, month, day);
    // A time must not move the missing value off its exact bit pattern.
    if (date == kMissing)
        return kMissing;
    return date + time;
}

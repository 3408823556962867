#include <plotaid/TimeConverter.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <string>
#include <utility>

namespace {

const double kMissing = -std::numeric_limits<double>::max();

// Days since 1970-01-01 of a proleptic Gregorian date, counted by 400-year eras with the year
// starting in March (an algorithm unrelated to the converter's month table).
std::int64_t civilDays(std::int64_t y, unsigned m, unsigned d) {
    y -= m <= 2;
    const std::int64_t era = (y >= 0 ? y : y - 399) / 400;
    const std::int64_t yoe = y - era * 400;
    const std::int64_t doy = (153 * (m > 2 ? m - 3 : m + 9) + 2) / 5 + d - 1;
    return era * 146097 + yoe * 365 + yoe / 4 - yoe / 100 + doy - 719468;
}

double secs(unsigned y, unsigned m, unsigned d) {
    return TimeConverter::ConvertYearMonthDayToSecs(y, m, d);
}

} // namespace

TEST(TimeConverter, DaysAgreeWithAnIndependentCalendar) {
    // Month 13 is next January and day 0 the day before the first; days before 1582-10-14 are
    // missing rather than wrapped. Every month 1..13 and day 0..31 of the first centuries, then
    // sampled years up to the last accepted one.
    auto check = [](unsigned year) {
        for (unsigned m = 1; m <= 13; ++m) {
            for (unsigned d = 0; d <= 31; ++d) {
                const std::int64_t days = civilDays(m == 13 ? year + 1 : year, m == 13 ? 1 : m, 1) +
                                          static_cast<std::int64_t>(d) - 1 - civilDays(1582, 10, 14);
                const double expected = days < 0 ? kMissing : static_cast<double>(days) * 86400.0;
                ASSERT_EQ(secs(year, m, d), expected) << year << "-" << m << "-" << d;
            }
        }
    };
    for (unsigned y = 1582; y <= 2500; ++y)
        check(y);
    for (unsigned y = 2501; y <= 5867441; y += 9973)
        check(y);
    for (unsigned y = 5867400; y <= 5867441; ++y)
        check(y);
}

TEST(TimeConverter, OutOfRangeFieldsGiveTheMissingValue) {
    const unsigned rows[][3] = {{1581, 12, 31}, {2000, 0, 1}, {2000, 14, 1}, {2000, 1, 32}, {5867442, 1, 1}};
    for (const auto& r : rows)
        EXPECT_EQ(secs(r[0], r[1], r[2]), kMissing) << r[0] << "-" << r[1] << "-" << r[2];
}

TEST(TimeConverter, StringToUnsignedIntAcceptsDigitsOnly) {
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt("0042"), 42u);
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt("4294967295"), 4294967295u);
    const std::string withNul("1\0002", 3);
    for (const std::string& bad :
         {std::string("4294967296"), std::string("4a"), std::string("a4"), std::string("-1"),
          std::string("+1"), std::string(" 1"), std::string(), withNul})
        EXPECT_EQ(TimeConverter::convertStringToUnsignedInt(bad), 0u) << bad;
}

TEST(TimeConverter, TimeTexts) {
    const std::pair<std::string, double> rows[] = {
        {"10:30:15", 37815.0},
        {"10:30:15.250", 37815.25},
        {"10:30:15,250", 37815.25},
        {"", 0.0},
        {"xx:30:15", 1815.0}, // a bad field counts as 0; the others still count
        {"1:2:3.4x", 3723.0},
        {"100:00", 360000.0},
        {"2000000:00", 7.2e9}, // beyond 32-bit seconds
        {"0:0:1.007", 1.007},
        {"0:0:1.123456", 1.123456},
        {"0:0:1." + std::string(400, '9'), 2.0},
        {"0:0:1.", 1.0},
    };
    for (const auto& r : rows)
        EXPECT_DOUBLE_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble(r.first), r.second) << r.first;
}

TEST(TimeConverter, DateTexts) {
    const std::pair<const char*, double> rows[] = {
        {"2024-03-0x", secs(2024, 2, 29)}, // a bad day reads as 0
        {"1582-10-15 00:00:01", 86401.0},
        {"1970-01-01 12:00", 141428.0 * 86400.0 + 43200.0},
        {"2024-13-00", secs(2024, 12, 31)},
    };
    for (const auto& r : rows)
        EXPECT_EQ(TimeConverter::convertDateFromISOFormatToKovarDouble(r.first), r.second) << r.first;
    for (const char* text : {"20240229", "2024-02", "2024-xx-01", "-2024-01-01", "1582-10-13 23:59:59"})
        EXPECT_EQ(TimeConverter::convertDateFromISOFormatToKovarDouble(text), kMissing) << text;
}

#include <plotaid/TimeConverter.h>

#include <gtest/gtest.h>

#include <cstdint>
#include <ctime>
#include <limits>

namespace {

const double kMissing = -1.7976931348623157e308;

// Days since 1970-01-01 of a proleptic Gregorian date, counted by 400-year eras with the year
// starting in March (an algorithm unrelated to the converter's month table).
std::int64_t civilDays(std::int64_t y, unsigned m, unsigned d) {
    y -= m <= 2;
    const std::int64_t era = (y >= 0 ? y : y - 399) / 400;
    const std::int64_t yoe = y - era * 400;
    const std::int64_t doy = (153 * (m > 2 ? m - 3 : m + 9) + 2) / 5 + d - 1;
    const std::int64_t doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
    return era * 146097 + doe - 719468;
}

// The converter's loose dates in plain terms: month 13 is next January, and the day counts on
// from the first of the month (day 0 the day before).
std::int64_t hostDays(std::int64_t y, unsigned m, unsigned d) {
    if (m == 13) {
        ++y;
        m = 1;
    }
    return civilDays(y, m, 1) + static_cast<std::int64_t>(d) - 1 - civilDays(1582, 10, 14);
}

} // namespace

TEST(TimeConverter, FirstDayOfTheCalendarIsZero) {
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(1582, 10, 14), 0.0);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(1582, 10, 15), 86400.0);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(1970, 1, 1), 141428.0 * 86400.0);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(2000, 3, 0),
              TimeConverter::ConvertYearMonthDayToSecs(2000, 2, 29));
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(1999, 13, 1),
              TimeConverter::ConvertYearMonthDayToSecs(2000, 1, 1));
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(2001, 2, 31),
              TimeConverter::ConvertYearMonthDayToSecs(2001, 3, 3));
    EXPECT_EQ(kMissing, -std::numeric_limits<double>::max());
}

TEST(TimeConverter, OutOfRangeFieldsGiveTheMissingValue) {
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(1581, 12, 31), kMissing);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(2000, 0, 1), kMissing);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(2000, 14, 1), kMissing);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(2000, 1, 32), kMissing);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(5867442, 1, 1), kMissing);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(0, 0, 0), kMissing);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(4294967295u, 1, 1), kMissing);
    EXPECT_NE(TimeConverter::ConvertYearMonthDayToSecs(5867441, 13, 31), kMissing);
}

TEST(TimeConverter, DaysOf1582BeforeTheCalendarBeganAreMissingNotWrapped) {
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(1582, 10, 13), kMissing);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(1582, 10, 0), kMissing);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(1582, 1, 1), kMissing);
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(1582, 9, 31), kMissing);
    // Day 0 of November 1582 is 31 October, after the start.
    EXPECT_EQ(TimeConverter::ConvertYearMonthDayToSecs(1582, 11, 0), 17.0 * 86400.0);
}

TEST(TimeConverter, SweepAgreesWithAnIndependentCalendar) {
    // Every month 1..13 and day 0..31 of four centuries around the start and the present, then
    // sampled years up to the last accepted one.
    auto check = [](unsigned year) {
        for (unsigned m = 1; m <= 13; ++m) {
            for (unsigned d = 0; d <= 31; ++d) {
                const std::int64_t days = hostDays(year, m, d);
                const double expected = days < 0 ? kMissing : static_cast<double>(days) * 86400.0;
                ASSERT_EQ(TimeConverter::ConvertYearMonthDayToSecs(year, m, d), expected)
                    << year << "-" << m << "-" << d;
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

TEST(TimeConverter, SweepAgreesWithTheCLibrary) {
    // timegm normalises day 0 and month overflow the same way the host does.
    const double origin = static_cast<double>(civilDays(1582, 10, 14)) * 86400.0;
    for (unsigned y = 1600; y <= 2400; y += 7) {
        for (unsigned m = 1; m <= 13; ++m) {
            for (unsigned d = 0; d <= 31; d += 3) {
                std::tm t{};
                t.tm_year = static_cast<int>(y) - 1900;
                t.tm_mon = static_cast<int>(m) - 1;
                t.tm_mday = static_cast<int>(d);
                const double expected = static_cast<double>(timegm(&t)) - origin;
                ASSERT_EQ(TimeConverter::ConvertYearMonthDayToSecs(y, m, d), expected)
                    << y << "-" << m << "-" << d;
            }
        }
    }
}

TEST(TimeConverter, StringToUnsignedIntAcceptsDigitsOnly) {
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt("0042"), 42u);
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt("4294967295"), 4294967295u);
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt("4294967296"), 0u); // modulo 2^32
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt("4a"), 0u);
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt("a4"), 0u);
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt("-1"), 0u);
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt("+1"), 0u);
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt(" 1"), 0u);
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt(""), 0u);
    EXPECT_EQ(TimeConverter::convertStringToUnsignedInt(std::string("1\0"
                                                                    "2",
                                                                    3)),
              0u);
}

TEST(TimeConverter, TimeTexts) {
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("10:30"), 37800.0);
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("10:30:15"), 37815.0);
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("10:30:15.250"), 37815.25);
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("10:30:15,250"), 37815.25);
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("1030"), 0.0);
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble(""), 0.0);
    // A bad field counts as 0; the others still count.
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("xx:30:15"), 1815.0);
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("1:2:3.4x"), 3723.0);
    // Durations beyond a day, and beyond what 32-bit seconds could hold.
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("100:00"), 360000.0);
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("2000000:00"), 7.2e9);
}

TEST(TimeConverter, FractionIsReadAsADecimalFractionOfAnyLength) {
    EXPECT_DOUBLE_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("0:0:1.5"), 1.5);
    EXPECT_DOUBLE_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("0:0:1.25"), 1.25);
    EXPECT_DOUBLE_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("0:0:1.007"), 1.007);
    EXPECT_DOUBLE_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("0:0:1.123456"), 1.123456);
    EXPECT_DOUBLE_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("0:0:1." + std::string(400, '9')),
                     2.0);
    EXPECT_EQ(TimeConverter::convertTimeFromISOFormatToKovarDouble("0:0:1."), 1.0);
}

TEST(TimeConverter, DateTexts) {
    // A bad day field reads as 0: the last day of the previous month.
    EXPECT_EQ(TimeConverter::convertDateFromISOFormatToKovarDouble("2024-03-0x"),
              TimeConverter::ConvertYearMonthDayToSecs(2024, 2, 29));
    EXPECT_EQ(TimeConverter::convertDateFromISOFormatToKovarDouble("1582-10-15"), 86400.0);
    EXPECT_EQ(TimeConverter::convertDateFromISOFormatToKovarDouble("1582-10-15 00:00:01"), 86401.0);
    EXPECT_EQ(TimeConverter::convertDateFromISOFormatToKovarDouble("1970-01-01 12:00"),
              141428.0 * 86400.0 + 43200.0);
    EXPECT_EQ(TimeConverter::convertDateFromISOFormatToKovarDouble("2024-02-29"),
              TimeConverter::ConvertYearMonthDayToSecs(2024, 2, 29));
    EXPECT_EQ(TimeConverter::convertDateFromISOFormatToKovarDouble("2024-13-00"),
              TimeConverter::ConvertYearMonthDayToSecs(2024, 12, 31));
}

TEST(TimeConverter, MalformedDatesAreMissingEvenWithATime) {
    for (const char* text : {"", "20240229", "2024-02", "2024-xx-01", "-2024-01-01", "2024-x-01",
                             "1582-10-13", "1582-10-13 23:59:59", "2024-00-01 10:00", "1581-12-31 23:59"})
        EXPECT_EQ(TimeConverter::convertDateFromISOFormatToKovarDouble(text), kMissing) << text;
}

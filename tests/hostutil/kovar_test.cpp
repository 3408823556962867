#include <kovar/kovarbase.h>
#include <kovar/kovarconv.h>
#include <kovar/kovarwin.h>
#include <plotaid/Kovar_Format.h>

#include <gtest/gtest.h>

#include <clocale>
#include <cstdint>
#include <cstring>

namespace {

std::uint64_t grouping() {
    std::uint64_t v;
    std::memcpy(&v, static_cast<unsigned char*>(kovar::pvGetCmnSys()) + 624, sizeof v);
    return v;
}

std::uint32_t minIntegerDigits() {
    std::uint32_t v;
    std::memcpy(&v, static_cast<unsigned char*>(kovar::pvGetCmnSys()) + 736, sizeof v);
    return v;
}

std::string print(double value, std::uint8_t type, std::uint16_t width, std::uint8_t decimals) {
    std::string out;
    kovar::ToString(value, Kovar_Format(type, width, decimals), out);
    return out;
}

class HostSettings : public ::testing::Test {
protected:
    void TearDown() override {
        kovar::resetCmnSys();
        kovar::setGFormatSmall(0.0001);
        kovar::currencyFormat::ResetCCX();
    }
};

} // namespace

TEST(KovarFormat, WidthRuleKeepsWideTextFormatsOnly) {
    EXPECT_EQ(Kovar_Format(1, 60, 0).GetWidth(), 60);
    EXPECT_EQ(Kovar_Format(2, 32767, 0).GetWidth(), 32767);
    EXPECT_EQ(Kovar_Format(5, 60, 2).GetWidth(), 40);
    EXPECT_EQ(Kovar_Format(5, 40, 2).GetWidth(), 40);
    EXPECT_EQ(Kovar_Format(5, 41, 2).GetWidth(), 40);
    EXPECT_EQ(Kovar_Format(20, 11, 0).GetWidth(), 11);
    const Kovar_Format f(17, 12, 3);
    EXPECT_EQ(f.GetType(), 17);
    EXPECT_EQ(f.GetDecimals(), 3);
    EXPECT_EQ(sizeof(Kovar_Format), 4u);

    Kovar_Format text(1, 100, 0);
    text.SetType(5);
    EXPECT_EQ(text.GetWidth(), 40);
    Kovar_Format number(5, 8, 2);
    number.SetWidth(200);
    EXPECT_EQ(number.GetWidth(), 40);
}

TEST_F(HostSettings, SystemBlockHasTheDefaultsAtTheHostsOffsets) {
    EXPECT_EQ(grouping(), 0u);
    EXPECT_EQ(minIntegerDigits(), 1u);
    kovar::setDigitGrouping(true);
    kovar::setMinIntegerDigits(3);
    EXPECT_NE(grouping(), 0u);
    EXPECT_EQ(minIntegerDigits(), 3u);
    // The same block every time.
    EXPECT_EQ(kovar::pvGetCmnSys(), kovar::pvGetCmnSys());
    kovar::resetCmnSys();
    EXPECT_EQ(grouping(), 0u);
    EXPECT_EQ(minIntegerDigits(), 1u);
}

TEST_F(HostSettings, SmallNumberThresholdAndCurrencies) {
    EXPECT_DOUBLE_EQ(kovar::GETGFORMATSMALL(), 0.0001);
    kovar::setGFormatSmall(0.5);
    EXPECT_DOUBLE_EQ(kovar::GETGFORMATSMALL(), 0.5);

    const kovar::currencyFormat currencies;
    for (int i = -1; i <= 5; ++i) {
        const kovar::customCurrency c = currencies.GetCCX(i);
        EXPECT_EQ(c.negativePrefix, "-");
        EXPECT_EQ(c.decimalIndicator, ".");
        EXPECT_EQ(c.prefix, "");
    }
    kovar::currencyFormat::SetCCX(2, {"EUR ", " net", "(", ")", ","});
    kovar::currencyFormat::SetCCX(7, {"never", "", "", "", ""});
    EXPECT_EQ(currencies.GetCCX(2).prefix, "EUR ");
    EXPECT_EQ(currencies.GetCCX(2).negativeSuffix, ")");
    EXPECT_EQ(currencies.GetCCX(1).prefix, "");
    EXPECT_EQ(currencies.GetCCX(7).prefix, "");
    EXPECT_EQ(print(-1234.5, 35, 20, 2), "  (EUR 1.234,50 net)");
    EXPECT_EQ(print(1234.5, 35, 20, 2), "    EUR 1.234,50 net");
}

TEST(KovarToString, NumbersAreRightAlignedInTheirWidth) {
    EXPECT_EQ(print(3.14159, 5, 8, 2), "    3.14");
    EXPECT_EQ(print(-2, 5, 6, 1), "  -2.0");
    EXPECT_EQ(print(1234567.891, 3, 14, 2), "  1,234,567.89");
    EXPECT_EQ(print(1234.5, 4, 10, 2), " $1,234.50");
    EXPECT_EQ(print(1234.5, 32, 10, 2), "  1.234,50");
    EXPECT_EQ(print(12.5, 31, 6, 1), " 12.5%");
    EXPECT_EQ(print(12345.0, 17, 10, 2), "  1.23e+04");
    EXPECT_EQ(print(999.0, 3, 3, 0), "999");
    EXPECT_EQ(print(1000.0, 3, 4, 0), "****"); // "1,000" does not fit
    EXPECT_EQ(print(kovar::kMissingValue, 5, 8, 2), "       .");
    EXPECT_EQ(print(5.0, 5, 0, 0), "");
}

TEST(KovarToString, HalvesRoundAwayFromZero) {
    EXPECT_EQ(print(42.25, 5, 5, 1), " 42.3");
    EXPECT_EQ(print(2.675, 5, 5, 2), " 2.68");
    EXPECT_EQ(print(0.5, 5, 3, 0), "  1");
    EXPECT_EQ(print(-0.5, 5, 3, 0), " -1");
    EXPECT_EQ(print(9.995, 5, 6, 2), " 10.00");
    EXPECT_EQ(print(999.5, 3, 5, 0), "1,000");
    EXPECT_EQ(print(0.04, 5, 4, 1), " 0.0");
    EXPECT_EQ(print(3.0, 5, 6, 3), " 3.000");
}

TEST(KovarToString, DatesAndTimesCountSecondsFromTheCalendarStart) {
    EXPECT_EQ(print(0.0, 39, 10, 0), "1582/10/14");
    EXPECT_EQ(print(86400.0, 20, 11, 0), "15-OCT-1582");
    const double y2k = 152385.0 * 86400.0; // 2000-01-01: 141428 + 10957 days
    EXPECT_EQ(print(y2k, 23, 10, 0), "01/01/2000");
    EXPECT_EQ(print(y2k + 59 * 86400.0, 38, 10, 0), "29.02.2000");
    EXPECT_EQ(print(y2k + 3723.0, 22, 20, 0), "01-JAN-2000 01:02:03");
    EXPECT_EQ(print(90061.0, 25, 10, 0), "1 01:01:01");
    EXPECT_EQ(print(37815.0, 21, 8, 0), "10:30:15");
    EXPECT_EQ(print(1e300, 20, 11, 0), "***********");
}

TEST(KovarToString, IgnoresTheProcessNumericLocale) {
    const char* old = std::setlocale(LC_NUMERIC, nullptr);
    const std::string saved = old ? old : "C";
    if (!std::setlocale(LC_NUMERIC, "de_DE.UTF-8") && !std::setlocale(LC_NUMERIC, "fr_FR.UTF-8"))
        GTEST_SKIP() << "no locale with a comma decimal point installed";
    const std::string printed = print(2.5, 5, 5, 1);
    std::setlocale(LC_NUMERIC, saved.c_str());
    EXPECT_EQ(printed, "  2.5");
}

#include <kovar/kovarbase.h>
#include <kovar/kovarconv.h>
#include <kovar/kovarwin.h>
#include <plotaid/Kovar_Format.h>

#include <gtest/gtest.h>

#include <clocale>
#include <cstdint>

namespace {

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
    EXPECT_EQ(sizeof(Kovar_Format), 4u);
    Kovar_Format text(1, 100, 0), number(5, 8, 2);
    text.SetType(5);
    number.SetWidth(200);
    const std::pair<Kovar_Format, int> widths[] = {{Kovar_Format(2, 32767, 0), 32767},
                                                   {Kovar_Format(5, 41, 2), 40},
                                                   {Kovar_Format(20, 11, 0), 11},
                                                   {text, 40},
                                                   {number, 40}};
    for (const auto& [format, width] : widths)
        EXPECT_EQ(format.GetWidth(), width) << int(format.GetType());
    EXPECT_EQ(Kovar_Format(17, 12, 3).GetType() * 10 + Kovar_Format(17, 12, 3).GetDecimals(), 173);
}

TEST_F(HostSettings, ThresholdAndCurrencies) {
    EXPECT_DOUBLE_EQ(kovar::GETGFORMATSMALL(), 0.0001);
    kovar::setGFormatSmall(0.5);
    EXPECT_DOUBLE_EQ(kovar::GETGFORMATSMALL(), 0.5);

    const kovar::currencyFormat currencies;
    for (int i = -1; i <= 5; ++i) {
        EXPECT_EQ(currencies.GetCCX(i).negativePrefix, "-") << i;
        EXPECT_EQ(currencies.GetCCX(i).decimalIndicator, ".") << i;
    }
    kovar::currencyFormat::SetCCX(2, {"EUR ", " net", "(", ")", ","});
    kovar::currencyFormat::SetCCX(7, {"never", "", "", "", ""});
    EXPECT_EQ(currencies.GetCCX(2).negativeSuffix, ")");
    EXPECT_EQ(currencies.GetCCX(1).prefix, "");
    EXPECT_EQ(currencies.GetCCX(7).prefix, "");
    EXPECT_EQ(print(-1234.5, 35, 20, 2), "  (EUR 1.234,50 net)");
    EXPECT_EQ(print(1234.5, 35, 20, 2), "    EUR 1.234,50 net");
}

TEST(KovarToString, RightAlignedRoundedHalfAwayDatesFromTheCalendarStart) {
    const double y2k = 152385.0 * 86400.0; // 2000-01-01: 141428 + 10957 days
    const struct {
        double value;
        std::uint8_t type;
        std::uint16_t width;
        std::uint8_t decimals;
        const char* expected;
    } rows[] = {
        {3.14159, 5, 8, 2, "    3.14"},
        {1234567.891, 3, 14, 2, "  1,234,567.89"},
        {1234.5, 4, 10, 2, " $1,234.50"},
        {1234.5, 32, 10, 2, "  1.234,50"},
        {12.5, 31, 6, 1, " 12.5%"},
        {12345.0, 17, 10, 2, "  1.23e+04"},
        {999.0, 3, 3, 0, "999"},
        {1000.0, 3, 4, 0, "****"}, // "1,000" does not fit
        {kovar::kMissingValue, 5, 8, 2, "       ."},
        {5.0, 5, 0, 0, ""},
        {2.675, 5, 5, 2, " 2.68"},
        {-0.5, 5, 3, 0, " -1"},
        {9.995, 5, 6, 2, " 10.00"},
        {999.5, 3, 5, 0, "1,000"},
        {0.04, 5, 4, 1, " 0.0"},
        {0.0, 39, 10, 0, "1582/10/14"},
        {86400.0, 20, 11, 0, "15-OCT-1582"},
        {y2k, 23, 10, 0, "01/01/2000"},
        {y2k + 59 * 86400.0, 38, 10, 0, "29.02.2000"},
        {y2k + 3723.0, 22, 20, 0, "01-JAN-2000 01:02:03"},
        {90061.0, 25, 10, 0, "1 01:01:01"},
        {37815.0, 21, 8, 0, "10:30:15"},
        {1e300, 20, 11, 0, "***********"},
    };
    for (const auto& r : rows)
        EXPECT_EQ(print(r.value, r.type, r.width, r.decimals), r.expected)
            << r.value << " type " << int(r.type);
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

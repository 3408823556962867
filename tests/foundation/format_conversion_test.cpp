#include <plotaid/ChartBase.h>
#include <plotaid/Kovar_Format.h>

#include "support/EngineSupport.h"

#include <grx/GrxModel.h>
#include <kovar/kovarbase.h>
#include <kovar/kovarconv.h>
#include <kovar/kovarwin.h>
#include <xercesc/dom/DOM.hpp>

#include <gtest/gtest.h>

#include <map>
#include <string>

namespace {

using Attributes = std::map<std::u16string, std::u16string>;
using Convert = bool (*)(GrxFormat&, const Kovar_Format&);

Kovar_Format host(int type, int width, int decimals) {
    return Kovar_Format(static_cast<std::uint8_t>(type), static_cast<std::uint16_t>(width),
                        static_cast<std::uint8_t>(decimals));
}

void resetHost() {
    kovar::resetCmnSys();
    kovar::setGFormatSmall(0.0001);
    kovar::currencyFormat::ResetCCX();
}

// One host format converted into a fresh format element. `expect` lists, split by '|': "name" (is
// "true"), "!name" (not "true"), "-name" (absent), "+name" (present), "name=text", "name#number"
// (absent counts as 0). A row with a currency sets that custom currency of the host first.
struct Row {
    int type, width, decimals;
    const char16_t* expect;
    void (*setHost)() = nullptr;
    Convert convert = &ChartBase::addFormat;
    kovar::customCurrency currency{};
};

class Formats : public engine_test::EngineTest {
protected:
    void fresh() {
        resetHost();
        chart = engine_test::Chart::empty();
        format = &chart.vis->addSourceVariable().addFormat();
    }
    void SetUp() override { fresh(); }
    void TearDown() override { resetHost(); }

    Attributes attributes() const {
        Attributes all;
        const xercesc::DOMNamedNodeMap* map = format->getImplementation()->getAttributes();
        for (XMLSize_t i = 0; i < map->getLength(); ++i)
            all[map->item(i)->getNodeName()] = map->item(i)->getNodeValue();
        return all;
    }

    void check(const Row& row) {
        fresh();
        if (row.setHost)
            row.setHost();
        if (row.type >= 33 && row.type <= 37)
            kovar::currencyFormat::SetCCX(row.type - 33, row.currency);
        SCOPED_TRACE("type " + std::to_string(row.type) + " width " + std::to_string(row.width) +
                     " decimals " + std::to_string(row.decimals));
        ASSERT_TRUE(row.convert(*format, host(row.type, row.width, row.decimals)));
        const Attributes all = attributes();
        const std::u16string wanted = row.expect;
        for (std::size_t from = 0, bar = 0; from <= wanted.size(); from = bar + 1) {
            bar = std::min(wanted.find(u'|', from), wanted.size());
            std::u16string item = wanted.substr(from, bar - from);
            const char16_t mode = std::u16string(u"!-+").find(item[0]) != std::u16string::npos ? item[0] : 0;
            item.erase(0, mode ? 1 : 0);
            const std::size_t eq = item.find_first_of(u"=#");
            const auto found = all.find(item.substr(0, eq));
            const std::u16string value = found == all.end() ? u"" : found->second;
            SCOPED_TRACE(std::string(item.begin(), item.end()));
            if (mode == u'-' || mode == u'+')
                EXPECT_EQ(found == all.end(), mode == u'-');
            else if (mode == u'!' || eq == std::u16string::npos)
                EXPECT_EQ(value == u"true", mode != u'!');
            else if (item[eq] == u'=')
                EXPECT_EQ(value, item.substr(eq + 1));
            else
                EXPECT_EQ(value.empty() ? 0.0 : std::stod(std::string(value.begin(), value.end())),
                          std::stod(std::string(item.begin() + eq + 1, item.end())));
        }
    }

    engine_test::Chart chart;
    GrxFormat* format = nullptr;
};

} // namespace

TEST_F(Formats, TextTypesOnlyGetTheErrorCharacterCommaIgnoresTheHostGrouping) {
    for (int type : {1, 2, 6, 7, 10, 11, 13, 14, 18, 19, 26, 27, 41, 255}) {
        fresh();
        EXPECT_TRUE(ChartBase::addFormat(*format, host(type, 8, 2))) << type;
        EXPECT_EQ(attributes(), (Attributes{{u"errorCharacter", u"*"}})) << type;
    }
    fresh();
    kovar::setDigitGrouping(false);
    ASSERT_TRUE(ChartBase::addFormat(*format, host(3, 8, 2)));
    EXPECT_EQ(attributes(), (Attributes{{u"errorCharacter", u"*"},
                                        {u"minimumFractionDigits", u"2"},
                                        {u"maximumFractionDigits", u"2"},
                                        {u"scientific", u"4"},
                                        {u"minimumIntegerDigits", u"1"},
                                        {u"useGrouping", u"true"},
                                        {u"separators", u".,/:"}}));
}

TEST_F(Formats, PlainNumbersGroupOnlyWhenTheHostDoes) {
    for (int type : {5, 8, 9, 12, 15, 16, 17, 31, 40}) {
        for (bool grouping : {false, true}) {
            fresh();
            kovar::setDigitGrouping(grouping);
            ASSERT_TRUE(ChartBase::FormatNumber(*format, host(type, 10, 2))) << type;
            // Types 8, 9, 12 keep grouping off whatever the host says.
            const bool never = type == 8 || type == 9 || type == 12;
            EXPECT_EQ(format->getUseGrouping(), grouping && !never) << type;
        }
    }
}

TEST_F(Formats, NumberTypes) {
    const Row rows[] = {
        {4, 10, 2, u"prefix=$|separators=.,/:|minimumIntegerDigits#2", [] { kovar::setMinIntegerDigits(2); }},
        {5, 8, 3, u"scientific#3|+smallNumberThreshold|smallNumberThreshold#0|maximumFractionDigits#3"},
        {40, 8, 3, u"scientific#3|smallNumberThreshold#0.25", [] { kovar::setGFormatSmall(0.25); }},
        {8, 10, 2, u"scientific#4"},
        {17, 8, 3, u"scientific#1"},
        {31, 8, 1, u"suffix=%"},
        {32, 8, 2, u"separators=,./:|useGrouping"},
        // Leading zeros pad the integer part, never below zero; corrupt host digits stay in a width.
        {15, 8, 2, u"minimumIntegerDigits#5"},
        {16, 8, 2, u"minimumIntegerDigits#6"},
        {15, 2, 5, u"minimumIntegerDigits#0"},
        {16, 2, 5, u"minimumIntegerDigits#0"},
        {5, 8, 2, u"minimumIntegerDigits#40", [] { kovar::setMinIntegerDigits(0xFFFFFFFFu); }},
        // A number width of 60 is read as 40 before conversion.
        {16, 60, 2, u"minimumIntegerDigits#38"},
    };
    for (const Row& row : rows)
        check(row);
}

TEST_F(Formats, DatesAndTimes) {
    const Convert date = &ChartBase::FormatDate;
    const Row rows[] = {
        {21, 5, 0,
         u"baseFormat#4|showHour|showMinute|!showSecond|!showMilliseconds|hourPadding|minutePadding|"
         u"-secondPadding|hourFormat#2"},
        {21, 8, 2,
         u"showSecond|secondPadding|showMilliseconds|minimumFractionDigits#3|maximumFractionDigits#3"},
        {21, 11, 5, u"maximumFractionDigits#5"},
        {21, 8, 0, u"showSecond|!showMilliseconds"},
        {20, 9, 0,
         u"yearAbbreviation|baseFormat#3|showDay|showMonth|showYear|!showHour|!showMinute|!showSecond|"
         u"monthFormat#1|dayType#1|separators=.,-:|mdyOrder#1|errorCharacter=*"},
        {20, 11, 0, u"!yearAbbreviation"},
        {23, 8, 0, u"separators=.,/:|mdyOrder#3|monthFormat#3|yearAbbreviation|dayPadding|dayOfMonthPadding"},
        {23, 10, 0, u"separators=.,/:|mdyOrder#3|!yearAbbreviation"},
        {38, 8, 0, u"separators=.,.:|mdyOrder#1|monthFormat#3|yearAbbreviation|dayPadding"},
        {39, 10, 0, u"separators=.,/:|mdyOrder#6|monthFormat#3|!yearAbbreviation|dayOfMonthPadding"},
        {22, 17, 2, u"showMinute|!showSecond|!showMilliseconds|+yearAbbreviation|!yearAbbreviation"},
        {22, 20, 0, u"showSecond|!showMilliseconds"},
        {22, 23, 2, u"showMilliseconds|minimumFractionDigits#3"},
        {24, 5, 0,
         u"baseFormat#1|dayType#2|hiddenSeparator=true|yearAbbreviation|!showMonth|mdyOrder#6|-separators"},
        {28, 8, 0, u"!yearAbbreviation|separators=., :|mdyOrder#3|!showDay"},
        {29, 6, 0, u"showQuarter|quarterSuffix= Q |yearAbbreviation|-mdyOrder"},
        {30, 10, 0, u"baseFormat#1|showWeek|weekSuffix= WK |!yearAbbreviation"},
        // Weekday and month names only through FormatDate (addFormat takes them as text).
        {26, 3, 0, u"showDayOfWeek|dayOfWeekAbbreviation|!showDay|!showMonth|!showYear|-errorCharacter",
         nullptr, date},
        {27, 3, 0, u"showMonth|monthFormat#2", nullptr, date},
        {27, 9, 0, u"monthFormat#1", nullptr, date},
        // Elapsed time: the fraction follows the decimals.
        {25, 12, 5,
         u"baseFormat#4|showMilliseconds|minimumFractionDigits#5|maximumFractionDigits#5|dayPadding|"
         u"hourPadding|minutePadding|secondPadding"},
        {25, 12, 0, u"!showMilliseconds|-maximumFractionDigits|useGrouping",
         [] { kovar::setDigitGrouping(true); }, &ChartBase::FormatElapsedTime},
        {25, 12, 1, u"maximumFractionDigits#3"},
    };
    for (const Row& row : rows)
        check(row);
}

TEST_F(Formats, CustomCurrenciesReadTheirOwnDefinition) {
    const std::pair<Row, kovar::customCurrency> rows[] = {
        {{33, 10, 2,
          u"negativesInParentheses|-negativesOutside|-prefix|-suffix|separators=.,/:|useGrouping|"
          u"maximumFractionDigits#2"},
         {"", "", "(", ")", "."}},
        {{37, 10, 1, u"negativesOutside|-negativesInParentheses|prefix=\u20AC |suffix= EUR|separators=,./:"},
         {"\xE2\x82\xAC ", " EUR", "-", "", ","}},
        {{34, 10, 0, u"negativesInParentheses"}, {"", "", "", "-", "."}},
        {{35, 10, 0, u"-negativesInParentheses|-negativesOutside"}, {"", "", "", "", "."}},
        {{36, 10, 0, u"prefix=C3"}, {"C3", "", "-", "", "."}},
    };
    for (auto [row, currency] : rows) {
        row.currency = currency;
        check(row);
    }
}

TEST_F(Formats, OtherTypesAreRefusedButKeepTheCommonSettings) {
    EXPECT_FALSE(ChartBase::FormatNumber(*format, host(20, 8, 2)));
    EXPECT_EQ(format->getScientific(), 4);
    EXPECT_EQ(format->getMaximumFractionDigits(), 2);
    fresh();
    for (int type : {5, 19, 25, 31, 37, 40})
        EXPECT_FALSE(ChartBase::FormatDate(*format, host(type, 8, 2))) << type;
    EXPECT_FALSE(ChartBase::FormatCustomCurrency(*format, host(32, 8, 2)));
    EXPECT_FALSE(ChartBase::FormatCustomCurrency(*format, host(38, 8, 2)));
    EXPECT_TRUE(attributes().empty());
}

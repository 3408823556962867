#include "foundation/FoundationSupport.h"

#include <plotaid/Kovar_Format.h>

#include <kovar/kovarbase.h>
#include <kovar/kovarconv.h>
#include <kovar/kovarwin.h>
#include <xercesc/dom/DOM.hpp>

#include <map>
#include <sstream>

using foundation_test::utf8;

namespace {

using Attributes = std::map<std::string, std::string>;
using Convert = bool (*)(GrxFormat&, const Kovar_Format&);

Kovar_Format host(int type, int width, int decimals) {
    return Kovar_Format(static_cast<std::uint8_t>(type), static_cast<std::uint16_t>(width),
                        static_cast<std::uint8_t>(decimals));
}

// One host format converted into a fresh format element. `expect` lists, split by '|': "name" (is
// "true"), "!name" (not "true"), "-name" (absent), "+name" (present), "name=text", "name#number"
// (absent counts as 0). A row with a currency sets that custom currency of the host first.
struct Row {
    int type, width, decimals;
    const char* expect;
    void (*setHost)() = nullptr;
    Convert convert = &ChartBase::addFormat;
    kovar::customCurrency currency{};
};

class Formats : public engine_test::EngineTest {
protected:
    void fresh() {
        kovar::resetCmnSys();
        kovar::setGFormatSmall(0.0001);
        kovar::currencyFormat::ResetCCX();
        chart = engine_test::Chart::empty();
        format = &chart.vis->addSourceVariable().addFormat();
    }
    void SetUp() override { fresh(); }
    void TearDown() override { fresh(); }

    Attributes attributes() const {
        Attributes all;
        const xercesc::DOMNamedNodeMap* map = format->getImplementation()->getAttributes();
        for (XMLSize_t i = 0; i < map->getLength(); ++i)
            all[utf8(map->item(i)->getNodeName())] = utf8(map->item(i)->getNodeValue());
        return all;
    }

    void check(const Row& row) {
        fresh();
        if (row.setHost)
            row.setHost();
        if (row.type >= 33 && row.type <= 37)
            kovar::currencyFormat::SetCCX(row.type - 33, row.currency);
        SCOPED_TRACE("type " + std::to_string(row.type) + " width " + std::to_string(row.width));
        ASSERT_TRUE(row.convert(*format, host(row.type, row.width, row.decimals)));
        const Attributes all = attributes();
        std::istringstream items(row.expect);
        std::smatch m;
        for (std::string item; std::getline(items, item, '|');) {
            ASSERT_TRUE(std::regex_match(item, m, std::regex(R"(([!+-]?)(\w+)([=#]?)(.*))"))) << item;
            const auto found = all.find(m.str(2));
            const std::string value = found == all.end() ? "" : found->second;
            if (m[1] == "-" || m[1] == "+")
                EXPECT_EQ(found == all.end(), m[1] == "-") << item;
            else if (m[3] == "=")
                EXPECT_EQ(value, m.str(4)) << item;
            else if (m[3] == "#")
                EXPECT_EQ(value.empty() ? 0.0 : std::stod(value), std::stod(m.str(4))) << item;
            else
                EXPECT_EQ(value == "true", m[1] != "!") << item;
        }
    }

    engine_test::Chart chart;
    GrxFormat* format = nullptr;
};

TEST_F(Formats, TextTypesOnlyGetTheErrorCharacterCommaIgnoresTheHostGrouping) {
    for (int type : {1, 2, 6, 7, 10, 11, 13, 14, 18, 19, 26, 27, 41, 255}) {
        fresh();
        EXPECT_TRUE(ChartBase::addFormat(*format, host(type, 8, 2))) << type;
        EXPECT_EQ(attributes(), (Attributes{{"errorCharacter", "*"}})) << type;
    }
    fresh();
    kovar::setDigitGrouping(false);
    ASSERT_TRUE(ChartBase::addFormat(*format, host(3, 8, 2)));
    EXPECT_EQ(attributes(), (Attributes{{"errorCharacter", "*"},
                                        {"minimumFractionDigits", "2"},
                                        {"maximumFractionDigits", "2"},
                                        {"scientific", "4"},
                                        {"minimumIntegerDigits", "1"},
                                        {"useGrouping", "true"},
                                        {"separators", ".,/:"}}));
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

TEST_F(Formats, NumberDateAndTimeTypes) {
    const Convert date = &ChartBase::FormatDate;
    const Row rows[] = {
        {4, 10, 2, "prefix=$|separators=.,/:|minimumIntegerDigits#2", [] { kovar::setMinIntegerDigits(2); }},
        {5, 8, 3, "scientific#3|+smallNumberThreshold|smallNumberThreshold#0|maximumFractionDigits#3"},
        {40, 8, 3, "scientific#3|smallNumberThreshold#0.25", [] { kovar::setGFormatSmall(0.25); }},
        {8, 10, 2, "scientific#4"},
        {17, 8, 3, "scientific#1"},
        {31, 8, 1, "suffix=%"},
        {32, 8, 2, "separators=,./:|useGrouping"},
        // Leading zeros pad the integer part, never below zero; corrupt host digits stay in a width.
        {15, 8, 2, "minimumIntegerDigits#5"},
        {16, 8, 2, "minimumIntegerDigits#6"},
        {15, 2, 5, "minimumIntegerDigits#0"},
        {5, 8, 2, "minimumIntegerDigits#40", [] { kovar::setMinIntegerDigits(0xFFFFFFFFu); }},
        // A number width of 60 is read as 40 before conversion.
        {16, 60, 2, "minimumIntegerDigits#38"},
        // Dates and times.
        {21, 5, 0,
         "baseFormat#4|showHour|showMinute|!showSecond|!showMilliseconds|hourPadding|minutePadding|"
         "-secondPadding|hourFormat#2"},
        {21, 8, 2,
         "showSecond|secondPadding|showMilliseconds|minimumFractionDigits#3|maximumFractionDigits#3"},
        {21, 11, 5, "maximumFractionDigits#5"},
        {21, 8, 0, "showSecond|!showMilliseconds"},
        {20, 9, 0,
         "yearAbbreviation|baseFormat#3|showDay|showMonth|showYear|!showHour|!showMinute|!showSecond|"
         "monthFormat#1|dayType#1|separators=.,-:|mdyOrder#1|errorCharacter=*"},
        {20, 11, 0, "!yearAbbreviation"},
        {23, 8, 0, "separators=.,/:|mdyOrder#3|monthFormat#3|yearAbbreviation|dayPadding|dayOfMonthPadding"},
        {23, 10, 0, "separators=.,/:|mdyOrder#3|!yearAbbreviation"},
        {38, 8, 0, "separators=.,.:|mdyOrder#1|monthFormat#3|yearAbbreviation|dayPadding"},
        {39, 10, 0, "separators=.,/:|mdyOrder#6|monthFormat#3|!yearAbbreviation|dayOfMonthPadding"},
        {22, 17, 2, "showMinute|!showSecond|!showMilliseconds|+yearAbbreviation|!yearAbbreviation"},
        {22, 20, 0, "showSecond|!showMilliseconds"},
        {22, 23, 2, "showMilliseconds|minimumFractionDigits#3"},
        {24, 5, 0,
         "baseFormat#1|dayType#2|hiddenSeparator=true|yearAbbreviation|!showMonth|mdyOrder#6|-separators"},
        {28, 8, 0, "!yearAbbreviation|separators=., :|mdyOrder#3|!showDay"},
        {29, 6, 0, "showQuarter|quarterSuffix= Q |yearAbbreviation|-mdyOrder"},
        {30, 10, 0, "baseFormat#1|showWeek|weekSuffix= WK |!yearAbbreviation"},
        // Weekday and month names only through FormatDate (addFormat takes them as text).
        {26, 3, 0, "showDayOfWeek|dayOfWeekAbbreviation|!showDay|!showMonth|!showYear|-errorCharacter",
         nullptr, date},
        {27, 3, 0, "showMonth|monthFormat#2", nullptr, date},
        {27, 9, 0, "monthFormat#1", nullptr, date},
        // Elapsed time: the fraction follows the decimals.
        {25, 12, 5,
         "baseFormat#4|showMilliseconds|minimumFractionDigits#5|maximumFractionDigits#5|dayPadding|"
         "hourPadding|minutePadding|secondPadding"},
        {25, 12, 0, "!showMilliseconds|-maximumFractionDigits|useGrouping",
         [] { kovar::setDigitGrouping(true); }, &ChartBase::FormatElapsedTime},
        {25, 12, 1, "maximumFractionDigits#3"}};
    for (const Row& row : rows)
        check(row);
}

TEST_F(Formats, CustomCurrenciesReadTheirOwnDefinition) {
    const std::pair<Row, kovar::customCurrency> rows[] = {
        {{33, 10, 2,
          "negativesInParentheses|-negativesOutside|-prefix|-suffix|separators=.,/:|useGrouping|"
          "maximumFractionDigits#2"},
         {"", "", "(", ")", "."}},
        {{37, 10, 1,
          "negativesOutside|-negativesInParentheses|prefix=\xE2\x82\xAC |suffix= EUR|separators=,./:"},
         {"\xE2\x82\xAC ", " EUR", "-", "", ","}},
        {{34, 10, 0, "negativesInParentheses"}, {"", "", "", "-", "."}},
        {{35, 10, 0, "-negativesInParentheses|-negativesOutside"}, {"", "", "", "", "."}},
        {{36, 10, 0, "prefix=C3"}, {"C3", "", "-", "", "."}}};
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

} // namespace

#include <plotaid/ChartBase.h>
#include <plotaid/Kovar_Format.h>

#include "foundation/XercesRuntime.h"

#include <grx/GrxModel.h>
#include <kovar/kovarbase.h>
#include <kovar/kovarconv.h>
#include <kovar/kovarwin.h>
#include <xercesc/dom/DOM.hpp>

#include <gtest/gtest.h>

#include <map>
#include <memory>
#include <string>

namespace {

using Attributes = std::map<std::u16string, std::u16string>;

// A fresh format in a fresh chart for each test; host settings back to their defaults after.
class Formats : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(runtime.ready());
        xercesc::DOMImplementation* impl = xercesc::DOMImplementationRegistry::getDOMImplementation(u"LS");
        xercesc::DOMDocument* doc =
            impl->createDocument(u"http://plotaid.org/grxml", u"visualization", nullptr);
        vis = std::make_unique<GrxVisualization>(doc->getDocumentElement(), true);
        format = &vis->addSourceVariable().addFormat();
    }
    void TearDown() override {
        kovar::resetCmnSys();
        kovar::setGFormatSmall(0.0001);
        kovar::currencyFormat::ResetCCX();
    }

    Attributes attributes() const {
        Attributes all;
        const xercesc::DOMNamedNodeMap* map = format->getImplementation()->getAttributes();
        for (XMLSize_t i = 0; i < map->getLength(); ++i)
            all[map->item(i)->getNodeName()] = map->item(i)->getNodeValue();
        return all;
    }
    std::u16string attr(const char16_t* name) const { return format->GetAttribute(name); }

    plotaid::detail::XercesRuntime runtime;
    std::unique_ptr<GrxVisualization> vis;
    GrxFormat* format = nullptr;
};

Kovar_Format host(int type, int width, int decimals) {
    return Kovar_Format(static_cast<std::uint8_t>(type), static_cast<std::uint16_t>(width),
                        static_cast<std::uint8_t>(decimals));
}

} // namespace

TEST_F(Formats, TextFormatOnlyGetsTheErrorCharacter) {
    for (int type : {1, 2, 6, 7, 10, 11, 13, 14, 18, 19, 26, 27, 41, 255}) {
        SetUp();
        EXPECT_TRUE(ChartBase::addFormat(*format, host(type, 8, 2))) << type;
        EXPECT_EQ(attributes(), (Attributes{{u"errorCharacter", u"*"}})) << type;
    }
}

TEST_F(Formats, CommaFormatIgnoresTheHostGrouping) {
    kovar::setDigitGrouping(false);
    kovar::setMinIntegerDigits(1);
    ASSERT_TRUE(ChartBase::addFormat(*format, host(3, 8, 2)));
    EXPECT_EQ(attributes(), (Attributes{{u"errorCharacter", u"*"},
                                        {u"minimumFractionDigits", u"2"},
                                        {u"maximumFractionDigits", u"2"},
                                        {u"scientific", u"4"},
                                        {u"minimumIntegerDigits", u"1"},
                                        {u"useGrouping", u"true"},
                                        {u"separators", u".,/:"}}));
    SetUp();
    kovar::setDigitGrouping(true);
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(3, 8, 2)));
    EXPECT_TRUE(format->getUseGrouping());
    EXPECT_EQ(format->getMinimumFractionDigits(), 2);
}

TEST_F(Formats, PlainNumbersGroupOnlyWhenTheHostDoes) {
    for (int type : {5, 15, 16, 17, 31, 40}) {
        for (bool grouping : {false, true}) {
            SetUp();
            kovar::setDigitGrouping(grouping);
            ASSERT_TRUE(ChartBase::FormatNumber(*format, host(type, 10, 2))) << type;
            EXPECT_EQ(format->getUseGrouping(), grouping) << type;
        }
    }
    // Types 8, 9, 12 keep grouping off whatever the host says.
    for (int type : {8, 9, 12}) {
        SetUp();
        kovar::setDigitGrouping(true);
        ASSERT_TRUE(ChartBase::FormatNumber(*format, host(type, 10, 2)));
        EXPECT_FALSE(format->getUseGrouping());
        EXPECT_EQ(format->getScientific(), 4);
    }
}

TEST_F(Formats, NumberTypesSetTheirOwnExtras) {
    kovar::setMinIntegerDigits(2);
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(4, 10, 2)));
    EXPECT_EQ(attr(u"prefix"), u"$");
    EXPECT_EQ(attr(u"separators"), u".,/:");
    EXPECT_EQ(format->getMinimumIntegerDigits(), 2);

    SetUp();
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(5, 8, 3)));
    EXPECT_EQ(format->getScientific(), 3);
    EXPECT_TRUE(format->isSmallNumberThresholdPresent());
    EXPECT_EQ(format->getSmallNumberThreshold(), 0.0);
    EXPECT_EQ(format->getMaximumFractionDigits(), 3);

    SetUp();
    kovar::setGFormatSmall(0.25);
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(40, 8, 3)));
    EXPECT_EQ(format->getScientific(), 3);
    EXPECT_EQ(format->getSmallNumberThreshold(), 0.25);

    SetUp();
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(17, 8, 3)));
    EXPECT_EQ(format->getScientific(), 1);

    SetUp();
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(31, 8, 1)));
    EXPECT_EQ(attr(u"suffix"), u"%");

    SetUp();
    kovar::setDigitGrouping(false);
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(32, 8, 2)));
    EXPECT_EQ(attr(u"separators"), u",./:");
    EXPECT_TRUE(format->getUseGrouping());
}

TEST_F(Formats, LeadingZeroFormatsPadTheIntegerPartNeverBelowZero) {
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(15, 8, 2)));
    EXPECT_EQ(format->getMinimumIntegerDigits(), 5);
    SetUp();
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(16, 8, 2)));
    EXPECT_EQ(format->getMinimumIntegerDigits(), 6);
    for (int type : {15, 16}) {
        SetUp();
        ASSERT_TRUE(ChartBase::FormatNumber(*format, host(type, 2, 5)));
        EXPECT_EQ(format->getMinimumIntegerDigits(), 0) << type;
    }
}

TEST_F(Formats, CorruptHostIntegerDigitsStayWithinAWidth) {
    kovar::setMinIntegerDigits(0xFFFFFFFFu);
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(5, 8, 2)));
    EXPECT_EQ(format->getMinimumIntegerDigits(), 40);
}

TEST_F(Formats, OtherTypesAreRefusedButKeepTheCommonSettings) {
    EXPECT_FALSE(ChartBase::FormatNumber(*format, host(20, 8, 2)));
    EXPECT_EQ(format->getScientific(), 4);
    EXPECT_EQ(format->getMaximumFractionDigits(), 2);

    SetUp();
    for (int type : {5, 19, 25, 31, 37, 40}) {
        EXPECT_FALSE(ChartBase::FormatDate(*format, host(type, 8, 2))) << type;
    }
    EXPECT_TRUE(attributes().empty());
    EXPECT_FALSE(ChartBase::FormatCustomCurrency(*format, host(32, 8, 2)));
    EXPECT_FALSE(ChartBase::FormatCustomCurrency(*format, host(38, 8, 2)));
    EXPECT_TRUE(attributes().empty());
}

TEST_F(Formats, TimeShowsSecondsAndFractionByWidthAndDecimals) {
    ASSERT_TRUE(ChartBase::addFormat(*format, host(21, 5, 0)));
    EXPECT_EQ(format->getBaseFormat(), 4);
    EXPECT_TRUE(format->getShowHour());
    EXPECT_TRUE(format->getShowMinute());
    EXPECT_FALSE(format->getShowSecond());
    EXPECT_FALSE(format->getShowMilliseconds());
    EXPECT_TRUE(format->getHourPadding());
    EXPECT_TRUE(format->getMinutePadding());
    EXPECT_FALSE(format->isSecondPaddingPresent());
    EXPECT_EQ(format->getHourFormat(), 2);

    SetUp();
    ASSERT_TRUE(ChartBase::addFormat(*format, host(21, 8, 2)));
    EXPECT_TRUE(format->getShowSecond());
    EXPECT_TRUE(format->getSecondPadding());
    EXPECT_TRUE(format->getShowMilliseconds());
    EXPECT_EQ(format->getMinimumFractionDigits(), 3);
    EXPECT_EQ(format->getMaximumFractionDigits(), 3);

    SetUp();
    ASSERT_TRUE(ChartBase::addFormat(*format, host(21, 11, 5)));
    EXPECT_EQ(format->getMaximumFractionDigits(), 5);

    SetUp();
    ASSERT_TRUE(ChartBase::addFormat(*format, host(21, 8, 0)));
    EXPECT_TRUE(format->getShowSecond());
    EXPECT_FALSE(format->getShowMilliseconds());
}

TEST_F(Formats, DateAbbreviatesTheYearWhenNarrow) {
    ASSERT_TRUE(ChartBase::addFormat(*format, host(20, 9, 0)));
    EXPECT_TRUE(format->getYearAbbreviation());
    EXPECT_EQ(format->getBaseFormat(), 3);
    EXPECT_TRUE(format->getShowDay() && format->getShowMonth() && format->getShowYear());
    EXPECT_FALSE(format->getShowHour() || format->getShowMinute() || format->getShowSecond());
    EXPECT_EQ(format->getMonthFormat(), 1);
    EXPECT_EQ(format->getDayType(), 1);
    EXPECT_EQ(attr(u"separators"), u".,-:");
    EXPECT_EQ(format->getMdyOrder(), 1);
    EXPECT_EQ(attr(u"errorCharacter"), u"*");

    SetUp();
    ASSERT_TRUE(ChartBase::addFormat(*format, host(20, 11, 0)));
    EXPECT_FALSE(format->getYearAbbreviation());
}

TEST_F(Formats, NumericDatesDifferInSeparatorsAndOrder) {
    struct Case {
        int type;
        const char16_t* separators;
        int order;
    };
    for (const Case& c : {Case{23, u".,/:", 3}, Case{38, u".,.:", 1}, Case{39, u".,/:", 6}}) {
        for (int width : {8, 10}) {
            SetUp();
            ASSERT_TRUE(ChartBase::addFormat(*format, host(c.type, width, 0))) << c.type;
            EXPECT_EQ(attr(u"separators"), c.separators) << c.type;
            EXPECT_EQ(format->getMdyOrder(), c.order) << c.type;
            EXPECT_EQ(format->getMonthFormat(), 3) << c.type;
            EXPECT_EQ(format->getYearAbbreviation(), width < 9) << c.type;
            EXPECT_TRUE(format->getDayPadding() && format->getDayOfMonthPadding()) << c.type;
        }
    }
}

TEST_F(Formats, DateTimeShowsSecondsOnlyWhenWide) {
    ASSERT_TRUE(ChartBase::addFormat(*format, host(22, 17, 2)));
    EXPECT_TRUE(format->getShowMinute());
    EXPECT_FALSE(format->getShowSecond());
    EXPECT_FALSE(format->getShowMilliseconds());
    EXPECT_FALSE(format->getYearAbbreviation());
    EXPECT_TRUE(format->isYearAbbreviationPresent());

    SetUp();
    ASSERT_TRUE(ChartBase::addFormat(*format, host(22, 20, 0)));
    EXPECT_TRUE(format->getShowSecond());
    EXPECT_FALSE(format->getShowMilliseconds());

    SetUp();
    ASSERT_TRUE(ChartBase::addFormat(*format, host(22, 23, 2)));
    EXPECT_TRUE(format->getShowMilliseconds());
    EXPECT_EQ(format->getMinimumFractionDigits(), 3);
}

TEST_F(Formats, OtherDateForms) {
    ASSERT_TRUE(ChartBase::addFormat(*format, host(24, 5, 0)));
    EXPECT_EQ(format->getBaseFormat(), 1);
    EXPECT_EQ(format->getDayType(), 2);
    EXPECT_EQ(attr(u"hiddenSeparator"), u"true");
    EXPECT_TRUE(format->getYearAbbreviation());
    EXPECT_FALSE(format->getShowMonth());
    EXPECT_EQ(format->getMdyOrder(), 6);
    EXPECT_FALSE(format->isSeparatorsPresent());

    SetUp();
    ASSERT_TRUE(ChartBase::addFormat(*format, host(28, 8, 0)));
    EXPECT_FALSE(format->getYearAbbreviation());
    EXPECT_EQ(attr(u"separators"), u"., :");
    EXPECT_EQ(format->getMdyOrder(), 3);
    EXPECT_FALSE(format->getShowDay());

    SetUp();
    ASSERT_TRUE(ChartBase::addFormat(*format, host(29, 6, 0)));
    EXPECT_TRUE(format->getShowQuarter());
    EXPECT_EQ(attr(u"quarterSuffix"), u" Q ");
    EXPECT_TRUE(format->getYearAbbreviation());
    EXPECT_FALSE(format->isMdyOrderPresent());

    SetUp();
    ASSERT_TRUE(ChartBase::addFormat(*format, host(30, 10, 0)));
    EXPECT_EQ(format->getBaseFormat(), 1);
    EXPECT_TRUE(format->getShowWeek());
    EXPECT_EQ(attr(u"weekSuffix"), u" WK ");
    EXPECT_FALSE(format->getYearAbbreviation());
}

TEST_F(Formats, WeekdayAndMonthNamesOnlyThroughFormatDate) {
    ASSERT_TRUE(ChartBase::FormatDate(*format, host(26, 3, 0)));
    EXPECT_TRUE(format->getShowDayOfWeek());
    EXPECT_TRUE(format->getDayOfWeekAbbreviation());
    EXPECT_FALSE(format->getShowDay() || format->getShowMonth() || format->getShowYear());
    EXPECT_FALSE(format->isErrorCharacterPresent());

    SetUp();
    ASSERT_TRUE(ChartBase::FormatDate(*format, host(27, 3, 0)));
    EXPECT_TRUE(format->getShowMonth());
    EXPECT_EQ(format->getMonthFormat(), 2);
    SetUp();
    ASSERT_TRUE(ChartBase::FormatDate(*format, host(27, 9, 0)));
    EXPECT_EQ(format->getMonthFormat(), 1);
}

TEST_F(Formats, ElapsedTimeFractionFollowsTheDecimals) {
    ASSERT_TRUE(ChartBase::addFormat(*format, host(25, 12, 5)));
    EXPECT_EQ(format->getBaseFormat(), 4);
    EXPECT_TRUE(format->getShowMilliseconds());
    EXPECT_EQ(format->getMinimumFractionDigits(), 5);
    EXPECT_EQ(format->getMaximumFractionDigits(), 5);
    EXPECT_TRUE(format->getDayPadding() && format->getHourPadding() && format->getMinutePadding() &&
                format->getSecondPadding());

    SetUp();
    kovar::setDigitGrouping(true);
    ASSERT_TRUE(ChartBase::FormatElapsedTime(*format, host(25, 12, 0)));
    EXPECT_FALSE(format->getShowMilliseconds());
    EXPECT_FALSE(format->isMaximumFractionDigitsPresent());
    EXPECT_TRUE(format->getUseGrouping());

    SetUp();
    ASSERT_TRUE(ChartBase::FormatElapsedTime(*format, host(25, 12, 1)));
    EXPECT_EQ(format->getMaximumFractionDigits(), 3);
}

TEST_F(Formats, CustomCurrencies) {
    kovar::currencyFormat::SetCCX(0, {"", "", "(", ")", "."});
    ASSERT_TRUE(ChartBase::addFormat(*format, host(33, 10, 2)));
    EXPECT_TRUE(format->getNegativesInParentheses());
    EXPECT_FALSE(format->isNegativesOutsidePresent());
    EXPECT_FALSE(format->isPrefixPresent());
    EXPECT_FALSE(format->isSuffixPresent());
    EXPECT_EQ(attr(u"separators"), u".,/:");
    EXPECT_TRUE(format->getUseGrouping());
    EXPECT_EQ(format->getMaximumFractionDigits(), 2);

    SetUp();
    kovar::currencyFormat::SetCCX(4, {"\xE2\x82\xAC ", " EUR", "-", "", ","});
    ASSERT_TRUE(ChartBase::addFormat(*format, host(37, 10, 1)));
    EXPECT_TRUE(format->getNegativesOutside());
    EXPECT_FALSE(format->isNegativesInParenthesesPresent());
    EXPECT_EQ(attr(u"prefix"), u"\u20AC ");
    EXPECT_EQ(attr(u"suffix"), u" EUR");
    EXPECT_EQ(attr(u"separators"), u",./:");

    SetUp();
    kovar::currencyFormat::SetCCX(1, {"", "", "", "-", "."});
    ASSERT_TRUE(ChartBase::addFormat(*format, host(34, 10, 0)));
    EXPECT_TRUE(format->getNegativesInParentheses());

    SetUp();
    kovar::currencyFormat::SetCCX(2, {"", "", "", "", "."});
    ASSERT_TRUE(ChartBase::addFormat(*format, host(35, 10, 0)));
    EXPECT_FALSE(format->isNegativesInParenthesesPresent());
    EXPECT_FALSE(format->isNegativesOutsidePresent());

    // Each type reads its own definition.
    SetUp();
    kovar::currencyFormat::SetCCX(3, {"C3", "", "-", "", "."});
    ASSERT_TRUE(ChartBase::addFormat(*format, host(36, 10, 0)));
    EXPECT_EQ(attr(u"prefix"), u"C3");
}

TEST_F(Formats, WideHostFormatsAreNarrowedBeforeConversion) {
    EXPECT_EQ(host(1, 60, 0).GetWidth(), 60);
    EXPECT_EQ(host(5, 60, 0).GetWidth(), 40);
    // A width of 60 read as 40: leading zeros for 40 - 2 digits, not 58.
    ASSERT_TRUE(ChartBase::FormatNumber(*format, host(16, 60, 2)));
    EXPECT_EQ(format->getMinimumIntegerDigits(), 38);
}

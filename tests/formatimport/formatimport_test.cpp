// Template format elements onto the object model's formats.
#include "support/EngineSupport.h"

#include <plotaid/BaseTemplate.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/parsers/XercesDOMParser.hpp>

#include <memory>
#include <string>

using namespace XERCES_CPP_NAMESPACE;
using engine_test::Chart;
using engine_test::EngineTest;

namespace {

class Probe : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override { return false; }
};

std::string utf8(const XMLCh* s) {
    return ChartString(s).toUTF8();
}

class FormatImport : public EngineTest {
protected:
    void SetUp() override {
        chart_ = Chart::empty();
        format_ = &chart_.vis->addSourceVariable().addFormat();
    }

    // A template element written as XML in the template namespace (the parser keeps it alive).
    const DOMElement* element(const std::string& body) {
        const std::string text = "<?xml version=\"1.0\"?>" + body;
        auto parser = std::make_unique<XercesDOMParser>();
        parser->setDoNamespaces(true);
        MemBufInputSource source(reinterpret_cast<const XMLByte*>(text.data()), text.size(), "format-test");
        parser->parse(source);
        const DOMDocument* document = parser->getDocument();
        if (document == nullptr || parser->getErrorCount() != 0)
            return nullptr;
        parsers_.push_back(std::move(parser));
        return document->getDocumentElement();
    }
    const DOMElement* inTemplate(const std::string& tag, const std::string& rest) {
        return element("<" + tag + " xmlns=\"http://plotaid.org/grxml\" " + rest + "</" + tag + ">");
    }
    const DOMElement* numberFormat(const std::string& attributes) {
        return inTemplate("numberFormat", attributes + ">");
    }
    const DOMElement* dateTime(const std::string& content) {
        return inTemplate("dateTimeFormat", ">" + content);
    }

    Probe probe() { return Probe(nullptr, *chart_.vis, nullptr); }
    std::string attribute(const XMLCh* name) const { return utf8(format_->GetAttribute(name)); }

    Chart chart_;
    GrxFormat* format_ = nullptr;
    std::vector<std::unique_ptr<XercesDOMParser>> parsers_;
};

TEST_F(FormatImport, GroupingGoesOffWhenAbsentButHidingNegativesStays) {
    format_->setUseGrouping(true);
    format_->setHideNegatives(true);
    format_->setNegativesOutside(true);
    format_->setNegativesInParentheses(true);
    const DOMElement* e = numberFormat("maximumFractionDigits=\"2\"");
    ASSERT_NE(e, nullptr);
    probe().importNumberFormat(*format_, e);
    EXPECT_FALSE(format_->getUseGrouping());
    EXPECT_TRUE(format_->getHideNegatives());
    EXPECT_FALSE(format_->getNegativesOutside());
    EXPECT_FALSE(format_->getNegativesInParentheses());
    EXPECT_EQ(format_->getMaximumFractionDigits(), 2);

    // Any other non-empty word switches hiding off; "true" switches the three on.
    probe().importNumberFormat(*format_, numberFormat("hideNegatives=\"yes\" useGrouping=\"true\""));
    EXPECT_FALSE(format_->getHideNegatives());
    EXPECT_TRUE(format_->getUseGrouping());
    probe().importNumberFormat(*format_,
                               numberFormat("hideNegatives=\"true\" negativesOutside=\"true\" "
                                            "negativesInParentheses=\"true\" useGrouping=\"TRUE\""));
    EXPECT_TRUE(format_->getHideNegatives());
    EXPECT_TRUE(format_->getNegativesOutside());
    EXPECT_TRUE(format_->getNegativesInParentheses());
    EXPECT_FALSE(format_->getUseGrouping()); // the comparison is exact
}

TEST_F(FormatImport, ScientificWordsPairUpAndOthersChangeNothing) {
    const struct {
        const char* word;
        int mode;
    } cases[] = {{"always", 1}, {"true", 1}, {"never", 2}, {"false", 2}};
    for (const auto& c : cases) {
        format_->setScientific(4);
        probe().importNumberFormat(*format_, numberFormat(std::string("scientific=\"") + c.word + "\""));
        EXPECT_EQ(format_->getScientific(), c.mode) << c.word;
    }
    for (const char* word : {"sometimes", "", "Always"}) {
        format_->setScientific(4);
        probe().importNumberFormat(*format_, numberFormat(std::string("scientific=\"") + word + "\""));
        EXPECT_EQ(format_->getScientific(), 4) << word;
    }
}

TEST_F(FormatImport, DigitsAndScalingAreSetOnlyWhenGiven) {
    format_->setMinimumFractionDigits(1);
    format_->setMaximumFractionDigits(5);
    format_->setMinimumIntegerDigits(2);
    format_->setMaximumIntegerDigits(9);
    format_->setScalingFactor(100.0);
    probe().importNumberFormat(*format_,
                               numberFormat("minimumFractionDigits=\"\" maximumFractionDigits=\"3\""));
    EXPECT_EQ(format_->getMinimumFractionDigits(), 1);
    EXPECT_EQ(format_->getMaximumFractionDigits(), 3);
    EXPECT_EQ(format_->getMinimumIntegerDigits(), 2);
    EXPECT_EQ(format_->getMaximumIntegerDigits(), 9);
    EXPECT_DOUBLE_EQ(format_->getScalingFactor(), 100.0);

    probe().importNumberFormat(*format_,
                               numberFormat("minimumFractionDigits=\"0\" minimumIntegerDigits=\"4\" "
                                            "maximumIntegerDigits=\"7\" scalingFactor=\"0.001\""));
    EXPECT_EQ(format_->getMinimumFractionDigits(), 0);
    EXPECT_EQ(format_->getMinimumIntegerDigits(), 4);
    EXPECT_EQ(format_->getMaximumIntegerDigits(), 7);
    EXPECT_DOUBLE_EQ(format_->getScalingFactor(), 0.001);
}

TEST_F(FormatImport, AnEmptyPrefixRemovesWhatTheFormatHad) {
    format_->setPrefix(u"$");
    format_->setSuffix(u" USD");
    probe().importNumberFormat(*format_, numberFormat("prefix=\"\" suffix=\" EUR\""));
    EXPECT_FALSE(format_->isPrefixPresent());
    EXPECT_EQ(attribute(GrxUni::_suffix), " EUR");

    // The string, elapsed-time and date-time formats treat the affixes alike, and nothing else.
    format_->setUseGrouping(true);
    probe().importStringFormat(*format_, inTemplate("stringFormat", "prefix=\"(\" suffix=\")\">"));
    EXPECT_EQ(attribute(GrxUni::_prefix), "(");
    EXPECT_EQ(attribute(GrxUni::_suffix), ")");
    EXPECT_TRUE(format_->getUseGrouping());
    probe().importElapsedTimeFormat(*format_, inTemplate("elapsedTimeFormat", "suffix=\" h\">"));
    EXPECT_FALSE(format_->isPrefixPresent());
    EXPECT_EQ(attribute(GrxUni::_suffix), " h");
    probe().importDateTimeFormat(*format_, dateTime(""));
    EXPECT_FALSE(format_->isPrefixPresent());
    EXPECT_FALSE(format_->isSuffixPresent());
    EXPECT_FALSE(format_->isBaseFormatPresent()); // neither a date nor a time part
    EXPECT_TRUE(format_->getUseGrouping());
}

TEST_F(FormatImport, NullElementsChangeNothing) {
    format_->setPrefix(u"$");
    format_->setUseGrouping(true);
    Probe p = probe();
    BaseTemplate::importFormat(*format_, nullptr);
    p.importNumberFormat(*format_, nullptr);
    p.importStringFormat(*format_, nullptr);
    p.importDateTimeFormat(*format_, nullptr);
    p.importElapsedTimeFormat(*format_, nullptr);
    EXPECT_EQ(attribute(GrxUni::_prefix), "$");
    EXPECT_TRUE(format_->getUseGrouping());
    EXPECT_EQ(format_->getImplementation()->getAttributes()->getLength(), 2u);
}

TEST_F(FormatImport, BaseFormatFollowsTheKindsOfPartsPresent) {
    probe().importDateTimeFormat(*format_, dateTime("<dateFormat/><timeFormat/>"));
    EXPECT_EQ(format_->getBaseFormat(), 3);
    probe().importDateTimeFormat(*format_, dateTime("<dateFormat/>"));
    EXPECT_EQ(format_->getBaseFormat(), 1);
    probe().importDateTimeFormat(*format_, dateTime("<timeFormat/>"));
    EXPECT_EQ(format_->getBaseFormat(), 2);
    probe().importDateTimeFormat(*format_, dateTime("<other><timeFormat/></other><dateFormat/>"));
    EXPECT_EQ(format_->getBaseFormat(), 3); // descendants at any depth count
    probe().importDateTimeFormat(*format_, dateTime("<other/>"));
    EXPECT_EQ(format_->getBaseFormat(), 3);
}

TEST_F(FormatImport, OnlyTheFirstDateFormatIsRead) {
    probe().importDateTimeFormat(*format_, dateTime("<dateFormat><year showCentury=\"true\"/></dateFormat>"
                                                    "<timeFormat><minute/></timeFormat>"
                                                    "<dateFormat><month fill=\"true\"/><era/></dateFormat>"));
    EXPECT_EQ(format_->getBaseFormat(), 3);
    EXPECT_TRUE(format_->getShowYear());
    EXPECT_FALSE(format_->getYearAbbreviation());
    EXPECT_TRUE(format_->getShowMinute());
    EXPECT_FALSE(format_->isShowMonthPresent());
    EXPECT_FALSE(format_->isMonthFormatPresent());
    EXPECT_FALSE(format_->isShowEraPresent());
}

TEST_F(FormatImport, DatePartsSwitchOnAndReadTheirAttributes) {
    probe().importDateTimeFormat(*format_,
                                 dateTime("<dateFormat><dayOfWeek long=\"true\"/>"
                                          "<dayOfMonth fill=\"true\"/><week fill=\"false\"/>"
                                          "<month fill=\"true\"/>"
                                          "<quarter prefix=\"Q\" suffix=\"\"/><year showCentury=\"false\"/>"
                                          "<era/></dateFormat>"));
    EXPECT_TRUE(format_->getShowDayOfWeek());
    EXPECT_FALSE(format_->getDayOfWeekAbbreviation());
    EXPECT_TRUE(format_->getShowDay());
    EXPECT_EQ(format_->getDayType(), 1);
    EXPECT_TRUE(format_->getDayPadding());
    EXPECT_TRUE(format_->getShowWeek());
    EXPECT_FALSE(format_->getWeekPadding());
    EXPECT_TRUE(format_->isWeekPaddingPresent());
    EXPECT_TRUE(format_->getShowMonth());
    EXPECT_EQ(format_->getMonthFormat(), 4);
    EXPECT_TRUE(format_->getShowQuarter());
    EXPECT_EQ(utf8(format_->getQuarterPrefix()), "Q");
    EXPECT_FALSE(format_->isQuarterSuffixPresent());
    EXPECT_TRUE(format_->getShowYear());
    EXPECT_TRUE(format_->getYearAbbreviation());
    EXPECT_TRUE(format_->getShowEra());

    // The day of the year comes after the day of the month and wins; a month name after a month.
    probe().importDateTimeFormat(*format_, dateTime("<dateFormat><dayOfYear fill=\"false\"/>"
                                                    "<dayOfMonth/><monthName long=\"false\"/>"
                                                    "<month fill=\"false\"/><dayOfWeek long=\"false\"/>"
                                                    "</dateFormat>"));
    EXPECT_EQ(format_->getDayType(), 2);
    EXPECT_FALSE(format_->getDayPadding());
    EXPECT_EQ(format_->getMonthFormat(), 1);
    EXPECT_TRUE(format_->getDayOfWeekAbbreviation());
    probe().importDateTimeFormat(*format_, dateTime("<dateFormat><monthName long=\"true\"/></dateFormat>"));
    EXPECT_EQ(format_->getMonthFormat(), 2);
}

TEST_F(FormatImport, PartsNotNamedStayAsTheyWere) {
    format_->setShowYear(true);
    format_->setShowSecond(true);
    format_->setDayPadding(true);
    format_->setMonthFormat(2);
    probe().importDateTimeFormat(*format_, dateTime("<dateFormat><dayOfMonth fill=\"maybe\"/>"
                                                    "<month/></dateFormat>"));
    EXPECT_TRUE(format_->getShowYear());
    EXPECT_TRUE(format_->getShowSecond());
    EXPECT_TRUE(format_->getDayPadding()); // a word other than true or false leaves it
    EXPECT_EQ(format_->getMonthFormat(), 2);
    EXPECT_TRUE(format_->getShowMonth());
}

TEST_F(FormatImport, HourFormatFromTwentyFourAndAmPm) {
    const struct {
        const char* attributes;
        int preset;
        int hourFormat;
    } cases[] = {
        {"twentyFour=\"true\" showAMPM=\"true\"", 0, 1},
        {"showAMPM=\"true\" twentyFour=\"true\"", 0, 1}, // attribute order in the text does not matter
        {"twentyFour=\"true\" showAMPM=\"false\"", 0, 2},
        {"twentyFour=\"false\"", 0, 3},
        {"showAMPM=\"false\"", 2, 2},
        {"twentyFour=\"yes\"", 3, 3},
    };
    for (const auto& c : cases) {
        format_->setHourFormat(c.preset);
        probe().importDateTimeFormat(
            *format_, dateTime(std::string("<timeFormat><hour ") + c.attributes + "/></timeFormat>"));
        EXPECT_EQ(format_->getHourFormat(), c.hourFormat) << c.attributes;
        EXPECT_TRUE(format_->getShowHour());
    }
}

TEST_F(FormatImport, TimePartsAndTheirPadding) {
    probe().importDateTimeFormat(*format_,
                                 dateTime("<timeFormat><hour fill=\"true\"/><minute fill=\"true\"/>"
                                          "<second fill=\"false\" milliseconds=\"true\"/></timeFormat>"));
    EXPECT_TRUE(format_->getHourPadding());
    EXPECT_TRUE(format_->getShowMinute());
    EXPECT_TRUE(format_->getMinutePadding());
    EXPECT_TRUE(format_->getShowSecond());
    EXPECT_FALSE(format_->getSecondPadding());
    EXPECT_TRUE(format_->getShowMilliseconds());
    EXPECT_FALSE(format_->isHourFormatPresent());
    probe().importDateTimeFormat(*format_, dateTime("<timeFormat><second milliseconds=\"false\"/>"
                                                    "<minute fill=\"false\"/></timeFormat>"));
    EXPECT_FALSE(format_->getShowMilliseconds());
    EXPECT_FALSE(format_->getMinutePadding());
    EXPECT_TRUE(format_->getHourPadding());
}

TEST_F(FormatImport, FormatReplacesEveryAttributeAndKeepsOneUnitRule) {
    format_->setPrefix(u"$");
    format_->setUseGrouping(true);
    format_->setBaseFormat(3);
    GrxUnitRule& old = format_->addUnitRule();
    old.setSuffix(u"old");
    const DOMElement* e = inTemplate("format", "suffix=\"%\" maximumFractionDigits=\"1\">"
                                               "<unitRule min=\"1000\" scale=\"0.001\" suffix=\"K\"/>"
                                               "<unitRule min=\"1000000\" scale=\"0.000001\" suffix=\"M\"/>");
    ASSERT_NE(e, nullptr);
    BaseTemplate::importFormat(*format_, e);
    EXPECT_EQ(format_->getImplementation()->getAttributes()->getLength(), 2u);
    EXPECT_FALSE(format_->isPrefixPresent());
    EXPECT_FALSE(format_->isUseGroupingPresent());
    EXPECT_FALSE(format_->isBaseFormatPresent());
    EXPECT_EQ(attribute(GrxUni::_suffix), "%");
    EXPECT_EQ(format_->getMaximumFractionDigits(), 1);
    const std::vector<GrxUnitRule*> rules = format_->getUnitRules();
    ASSERT_EQ(rules.size(), 1u);
    EXPECT_EQ(utf8(rules[0]->getSuffix()), "K");
    EXPECT_DOUBLE_EQ(rules[0]->getMin(), 1000.0);
    EXPECT_DOUBLE_EQ(rules[0]->getScale(), 0.001);

    // Without unit rules in the template the format keeps none.
    BaseTemplate::importFormat(*format_, inTemplate("format", "prefix=\"#\">"));
    EXPECT_TRUE(format_->getUnitRules().empty());
    EXPECT_EQ(attribute(GrxUni::_prefix), "#");
    EXPECT_FALSE(format_->isSuffixPresent());
}

TEST_F(FormatImport, AFormatIdTakenElsewhereIsNotCopied) {
    GrxSourceVariable& other = chart_.vis->addSourceVariable();
    other.setId(u"taken");
    BaseTemplate::importFormat(*format_, inTemplate("format", "id=\"taken\" prefix=\"$\">"));
    EXPECT_EQ(chart_.vis->getElementById(u"taken"), other.getImplementation());
    EXPECT_FALSE(format_->isIdPresent());
    EXPECT_EQ(attribute(GrxUni::_prefix), "$");

    BaseTemplate::importFormat(*format_, inTemplate("format", "id=\"fresh\">"));
    EXPECT_EQ(chart_.vis->getElementById(u"fresh"), format_->getImplementation());
}

} // namespace

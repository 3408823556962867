// Template format elements onto the object model's formats.
#include "templates/TemplateSupport.h"

#include <xercesc/framework/MemBufInputSource.hpp>
#include <xercesc/parsers/XercesDOMParser.hpp>

#include <cstdlib>
#include <memory>
#include <sstream>

using namespace template_test;
using namespace XERCES_CPP_NAMESPACE;

namespace {

class FormatImport : public TemplateTest {
protected:
    void fresh() { format_ = &chart_.addSourceVariable().addFormat(); }

    // Imports the template element through the operation its tag names; date and time parts
    // alone stand for a date-time format of them.
    void import(const std::string& body) {
        const bool parts = body.rfind("<dateFormat", 0) == 0 || body.rfind("<timeFormat", 0) == 0;
        const std::string text = "<w xmlns=\"http://plotaid.org/grxml\">" +
                                 (parts ? "<dateTimeFormat>" + body + "</dateTimeFormat>" : body) + "</w>";
        parsers_.push_back(std::make_unique<XercesDOMParser>());
        parsers_.back()->setDoNamespaces(true);
        MemBufInputSource source(reinterpret_cast<const XMLByte*>(text.data()), text.size(), "format-test");
        parsers_.back()->parse(source);
        ASSERT_EQ(parsers_.back()->getErrorCount(), 0u) << body;
        const DOMElement* e = parsers_.back()->getDocument()->getDocumentElement()->getFirstElementChild();
        const std::string tag = u8(e->getLocalName());
        Probe probe(nullptr, chart_, nullptr); // each kind through the operation its tag names
        if (tag == "numberFormat")
            probe.importNumberFormat(*format_, e);
        else if (tag == "stringFormat")
            probe.importStringFormat(*format_, e);
        else if (tag == "elapsedTimeFormat")
            probe.importElapsedTimeFormat(*format_, e);
        else if (tag == "dateTimeFormat")
            probe.importDateTimeFormat(*format_, e);
        else
            BaseTemplate::importFormat(*format_, e);
    }

    // "name=value ..." written straight onto the format.
    void preset(const std::string& pairs) {
        std::istringstream in(pairs);
        for (std::string pair; in >> pair;)
            format_->SetAttribute(ChartString(pair.substr(0, pair.find('='))).xc_str(),
                                  ChartString(pair.substr(pair.find('=') + 1)));
    }

    // The format's values of the names in `expected` ("name=value ...", "-" for absent), numbers
    // compared as numbers.
    std::string state(const std::string& expected) const {
        std::istringstream in(expected);
        std::string out;
        for (std::string pair; in >> pair;) {
            const std::string name = pair.substr(0, pair.find('=')), value = attr(format_, name);
            char* end = nullptr;
            std::ostringstream number;
            number << std::strtod(value.c_str(), &end);
            out += (out.empty() ? "" : " ") + name + "=" +
                   (!value.empty() && *end == '\0' ? number.str() : value);
        }
        return out;
    }

    GrxVisualization& chart_ = empty();
    GrxFormat* format_ = &chart_.addSourceVariable().addFormat();
    std::vector<std::unique_ptr<XercesDOMParser>> parsers_;
};

TEST_F(FormatImport, EachFormatKindSetsWhatItNamesAndClearsWhatItMustOnly) {
    const struct {
        std::string preset;
        std::string element;
        std::string expected;
    } cases[] = {
        // Grouping and the negative placements go off when absent; hiding negatives stays.
        {"useGrouping=true hideNegatives=true negativesOutside=true negativesInParentheses=true",
         "<numberFormat maximumFractionDigits='2'/>",
         "useGrouping=false hideNegatives=true negativesOutside=false negativesInParentheses=false "
         "maximumFractionDigits=2"},
        {"hideNegatives=true", "<numberFormat hideNegatives='yes' useGrouping='true'/>",
         "hideNegatives=false useGrouping=true"},
        {"", // the comparison with "true" is exact
         "<numberFormat hideNegatives='true' negativesOutside='true' negativesInParentheses='true' "
         "useGrouping='TRUE'/>",
         "hideNegatives=true negativesOutside=true negativesInParentheses=true useGrouping=false"},
        {"scientific=4", "<numberFormat scientific='always'/>", "scientific=1"},
        {"scientific=4", "<numberFormat scientific='true'/>", "scientific=1"},
        {"scientific=4", "<numberFormat scientific='never'/>", "scientific=2"},
        {"scientific=4", "<numberFormat scientific='false'/>", "scientific=2"},
        {"scientific=4", "<numberFormat scientific=''/>", "scientific=4"},
        {"scientific=4", "<numberFormat scientific='Always'/>", "scientific=4"},
        // Digits and scaling only when given and not empty.
        {"minimumFractionDigits=1 maximumFractionDigits=5 minimumIntegerDigits=2 maximumIntegerDigits=9 "
         "scalingFactor=100",
         "<numberFormat minimumFractionDigits='' maximumFractionDigits='3'/>",
         "minimumFractionDigits=1 maximumFractionDigits=3 minimumIntegerDigits=2 maximumIntegerDigits=9 "
         "scalingFactor=100"},
        {"minimumFractionDigits=1",
         "<numberFormat minimumFractionDigits='0' minimumIntegerDigits='4' maximumIntegerDigits='7' "
         "scalingFactor='0.001'/>",
         "minimumFractionDigits=0 minimumIntegerDigits=4 maximumIntegerDigits=7 scalingFactor=0.001"},
        // Affixes: an empty or absent one removes what the format had; the other kinds touch nothing else.
        {"prefix=$ suffix=USD", "<numberFormat prefix='' suffix='EUR'/>", "prefix=- suffix=EUR"},
        {"useGrouping=true", "<stringFormat prefix='(' suffix=')'/>", "prefix=( suffix=) useGrouping=true"},
        {"prefix=( useGrouping=true", "<elapsedTimeFormat suffix='h'/>",
         "prefix=- suffix=h useGrouping=true"},
        {"prefix=( suffix=h useGrouping=true", "<dateTimeFormat/>",
         "prefix=- suffix=- baseFormat=- useGrouping=true"},
        // The base format follows the kinds of parts present at any depth.
        {"", "<dateFormat/><timeFormat/>", "baseFormat=3"},
        {"baseFormat=3", "<dateFormat/>", "baseFormat=1"},
        {"", "<timeFormat/>", "baseFormat=2"},
        {"", "<dateTimeFormat><other><timeFormat/></other><dateFormat/></dateTimeFormat>", "baseFormat=3"},
        {"baseFormat=3", "<dateTimeFormat><other/></dateTimeFormat>", "baseFormat=3"},
        // Only the first date format is read.
        {"",
         "<dateFormat><year "
         "showCentury='true'/></dateFormat><timeFormat><minute/></timeFormat><dateFormat><month "
         "fill='true'/><era/></dateFormat>",
         "baseFormat=3 showYear=true yearAbbreviation=false showMinute=true showMonth=- monthFormat=- "
         "showEra=-"},
        {"",
         "<dateFormat><dayOfWeek long='true'/><dayOfMonth fill='true'/><week fill='false'/><month "
         "fill='true'/>"
         "<quarter prefix='Q' suffix=''/><year showCentury='false'/><era/></dateFormat>",
         "showDayOfWeek=true dayOfWeekAbbreviation=false showDay=true dayType=1 dayPadding=true "
         "showWeek=true weekPadding=false "
         "showMonth=true monthFormat=4 showQuarter=true quarterPrefix=Q quarterSuffix=- showYear=true "
         "yearAbbreviation=true showEra=true"},
        // The day of the year wins over the day of the month; a month name over a month.
        {"dayPadding=true monthFormat=4",
         "<dateFormat><dayOfYear fill='false'/><dayOfMonth/><monthName long='false'/><month "
         "fill='false'/><dayOfWeek long='false'/></dateFormat>",
         "dayType=2 dayPadding=false monthFormat=1 dayOfWeekAbbreviation=true"},
        {"", "<dateFormat><monthName long='true'/></dateFormat>", "monthFormat=2"},
        // Parts not named stay; a fill other than true or false leaves the padding.
        {"showYear=true showSecond=true dayPadding=true monthFormat=2",
         "<dateFormat><dayOfMonth fill='maybe'/><month/></dateFormat>",
         "showYear=true showSecond=true dayPadding=true monthFormat=2 showMonth=true"},
        // The hour format from 24 hours and AM/PM, in any attribute order.
        {"hourFormat=0", "<timeFormat><hour twentyFour='true' showAMPM='true'/></timeFormat>",
         "hourFormat=1 showHour=true"},
        {"hourFormat=0", "<timeFormat><hour showAMPM='true' twentyFour='true'/></timeFormat>",
         "hourFormat=1 showHour=true"},
        {"hourFormat=0", "<timeFormat><hour twentyFour='true' showAMPM='false'/></timeFormat>",
         "hourFormat=2 showHour=true"},
        {"hourFormat=0", "<timeFormat><hour twentyFour='false'/></timeFormat>", "hourFormat=3 showHour=true"},
        {"hourFormat=2", "<timeFormat><hour showAMPM='false'/></timeFormat>", "hourFormat=2 showHour=true"},
        {"hourFormat=3", "<timeFormat><hour twentyFour='yes'/></timeFormat>", "hourFormat=3 showHour=true"},
        {"",
         "<timeFormat><hour fill='true'/><minute fill='true'/><second fill='false' "
         "milliseconds='true'/></timeFormat>",
         "hourPadding=true showMinute=true minutePadding=true showSecond=true secondPadding=false "
         "showMilliseconds=true hourFormat=-"},
        {"hourPadding=true showMilliseconds=true minutePadding=true",
         "<timeFormat><second milliseconds='false'/><minute fill='false'/></timeFormat>",
         "showMilliseconds=false minutePadding=false hourPadding=true"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.element);
        fresh();
        preset(c.preset);
        import(c.element);
        EXPECT_EQ(state(c.expected), c.expected);
    }
}

TEST_F(FormatImport, NullElementsChangeNothing) {
    preset("prefix=$ useGrouping=true");
    Probe p(nullptr, chart_, nullptr);
    BaseTemplate::importFormat(*format_, nullptr);
    p.importNumberFormat(*format_, nullptr);
    p.importStringFormat(*format_, nullptr);
    p.importDateTimeFormat(*format_, nullptr);
    p.importElapsedTimeFormat(*format_, nullptr);
    EXPECT_EQ(state("prefix=$ useGrouping=true"), "prefix=$ useGrouping=true");
    EXPECT_EQ(format_->getImplementation()->getAttributes()->getLength(), 2u);
}

TEST_F(FormatImport, FormatReplacesEveryAttributeKeepsOneUnitRuleAndNoTakenId) {
    preset("prefix=$ useGrouping=true baseFormat=3");
    format_->addUnitRule().setSuffix(u"old");
    import("<format suffix='%' maximumFractionDigits='1'><unitRule min='1000' scale='0.001' suffix='K'/>"
           "<unitRule min='1000000' scale='0.000001' suffix='M'/></format>");
    EXPECT_EQ(format_->getImplementation()->getAttributes()->getLength(), 2u);
    EXPECT_EQ(state("suffix=% maximumFractionDigits=1"), "suffix=% maximumFractionDigits=1");
    const std::vector<GrxUnitRule*> rules = format_->getUnitRules();
    ASSERT_EQ(rules.size(), 1u);
    EXPECT_EQ(u8(rules[0]->getSuffix()), "K");
    EXPECT_DOUBLE_EQ(rules[0]->getMin(), 1000.0);
    EXPECT_DOUBLE_EQ(rules[0]->getScale(), 0.001);

    // Without unit rules in the template the format keeps none; an id taken elsewhere stays there.
    GrxSourceVariable& other = chart_.addSourceVariable();
    other.setId(u"taken");
    import("<format id='taken' prefix='#'/>");
    EXPECT_TRUE(format_->getUnitRules().empty());
    EXPECT_EQ(state("prefix=# suffix=- id=-"), "prefix=# suffix=- id=-");
    EXPECT_EQ(chart_.getElementById(u"taken"), other.getImplementation());
    import("<format id='fresh'/>");
    EXPECT_EQ(chart_.getElementById(u"fresh"), format_->getImplementation());
}

} // namespace

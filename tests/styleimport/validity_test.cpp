// Restyled sample charts still satisfy the chart grammar, by Xerces-C and by xmllint.
#include "StyleImportSupport.h"

#include "support/GrammarSupport.h"

using namespace XERCES_CPP_NAMESPACE;
using engine_test::Chart;
using engine_test::EngineTest;
using styleimport_test::Probe;

namespace {

const std::string kRichStyle =
    "<style value=\"fill:#112233;stroke:#445566;color:#778899;font-size:11pt;min-font-size:7pt;"
    "font-weight:normal;font-style:italic;font-family:Serif;visibility:visible;stroke-dasharray:4 2;"
    "stroke-width:1pt;max-width:80%;width:50%;glyph-sides:5;glyph-angle:10;glyph-aspect:1;"
    "shadow:gray;shadow-dx:1px;shadow-dy:1px;shadow-opacity:0.5;fill-pattern:2;symbol:circle;size:4pt;"
    "label-location-x:left;label-location-y:top;label-location-inside:1;text-fit:shrink;depth:3;"
    "margin:1pt;padding:2pt;stroke-linecap:round;odd:1\""
    R"( gradient-method="linear" gradient-color="red" gradient-opacity="1" opacity2="0" margin-top="1pt"
        textAlignment="left">
      <glyph sides="6" angle="15" aspect="0.5" size="5pt" type="square"/>
      <shadow color="black" dx="2px" dy="2px" opacity="0.3"/>
      <intervalGlyph type="cross"/>
      <interpolation type="jump" pointPosition="right" missingRepresentation="wings"/>
    </style>)";

using RestyledCharts = EngineTest;

TEST_F(RestyledCharts, EverySampleChartWithEveryStyleRestyledStillValidates) {
    const std::vector<std::string> charts = grammar_test::sampleCharts();
    ASSERT_GE(charts.size(), 10u);
    styleimport_test::StyleElements elements;
    const DOMElement* style = elements.make(kRichStyle);
    ASSERT_NE(style, nullptr);
    for (const std::string& path : charts) {
        const std::string text = grammar_test::readText(path);
        const Chart source = Chart::parse(text);
        for (const bool withSource : {false, true}) {
            SCOPED_TRACE(path + (withSource ? " (with source)" : ""));
            Chart chart = Chart::parse(text);
            ASSERT_TRUE(chart.vis);
            const std::string before = chart.vis->AsUTF8();
            Probe probe(withSource ? source.vis.get() : nullptr, *chart.vis, nullptr);
            for (GrxStyle* s : styleimport_test::stylesWithIds(chart))
                probe.importStyle(style, *s);
            EXPECT_NE(chart.vis->AsUTF8(), before);
            EXPECT_EQ(grammar_test::chartFaults(*chart.vis), "");
        }
    }
}

} // namespace

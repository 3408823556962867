// Restyled sample charts still satisfy the chart grammar, by Xerces-C and by xmllint.
#include "StyleImportSupport.h"

#include "support/TestSupport.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sys/wait.h>

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

class LintedFile {
public:
    explicit LintedFile(const std::string& text) : path_(dir_.file("chart.xml")) {
        std::ofstream(path_, std::ios::binary) << text;
    }
    // xmllint's exit code, its output in `output`; schemas resolve to the source tree's, offline.
    int lint(std::string& output) const {
        const std::string schemas = std::string(PLOTAID_SOURCE_DIR) + "/resources/schemas/";
        const std::string catalog = dir_.file("catalog.xml");
        std::ofstream(catalog)
            << "<?xml version=\"1.0\"?>\n"
               "<catalog xmlns=\"urn:oasis:names:tc:entity:xmlns:xml:catalog\">\n"
               "  <rewriteSystem systemIdStartString=\"http://plotaid.org/grxml/\" "
               "rewritePrefix=\"file://"
            << schemas
            << "\"/>\n"
               "  <rewriteURI uriStartString=\"http://plotaid.org/grxml/\" rewritePrefix=\"file://"
            << schemas << "\"/>\n</catalog>\n";
        const std::string command = "XML_CATALOG_FILES='" + catalog + "' xmllint --nonet --noout --schema '" +
                                    schemas + "grxml-2.9.xsd' '" + path_ + "' 2>&1";
        FILE* pipe = ::popen(command.c_str(), "r");
        if (pipe == nullptr)
            return -1;
        char buffer[4096];
        std::size_t n;
        while ((n = std::fread(buffer, 1, sizeof buffer, pipe)) > 0)
            output.append(buffer, n);
        const int status = ::pclose(pipe);
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }

private:
    TempDir dir_;
    std::string path_;
};

bool haveXmllint() {
    return std::system("xmllint --version >/dev/null 2>&1") == 0;
}

// Both validators on one chart text: Xerces-C through the library's validating parser, then xmllint.
void expectValid(const std::string& text, const std::string& name) {
    plotaid::detail::ValidatingParser parser;
    EXPECT_NE(parser.parse(text, "restyled", ChartException("restyled chart", "styleimport_test", 0)),
              nullptr)
        << name << ": " << (parser.lastErrors().empty() ? "" : parser.lastErrors().front());
    if (!haveXmllint())
        return;
    std::string output;
    EXPECT_EQ(LintedFile(text).lint(output), 0) << name << "\n" << output;
}

using RestyledCharts = EngineTest;

TEST_F(RestyledCharts, EverySampleChartWithEveryStyleRestyledStillValidates) {
    std::vector<std::string> names;
    for (const auto& entry :
         std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/charts"))
        names.push_back(entry.path().filename().string());
    ASSERT_GE(names.size(), 10u);
    styleimport_test::StyleElements elements;
    const DOMElement* style = elements.make(kRichStyle);
    ASSERT_NE(style, nullptr);
    for (const std::string& name : names) {
        const Chart source = styleimport_test::sample(name);
        for (const bool withSource : {false, true}) {
            Chart chart = styleimport_test::sample(name);
            ASSERT_TRUE(chart.vis) << name;
            const std::string before = chart.vis->AsUTF8();
            Probe probe(withSource ? source.vis.get() : nullptr, *chart.vis, nullptr);
            for (GrxStyle* s : styleimport_test::stylesWithIds(chart))
                probe.importStyle(style, *s);
            const std::string after = chart.vis->AsUTF8();
            EXPECT_NE(after, before) << name;
            expectValid(after, name + (withSource ? " (with source)" : ""));
        }
    }
}

TEST_F(RestyledCharts, TheCheckRejectsABrokenChart) {
    Chart chart = styleimport_test::sample("line-series.xml");
    ASSERT_TRUE(chart.vis);
    // A style holds only styles.
    DOMElement* lineStyle = chart.vis->getStyleById(u"lineStyle")->getImplementation();
    lineStyle->appendChild(chart.document()->createElementNS(u"http://plotaid.org/grxml", u"bogus"));
    const std::string text = chart.vis->AsUTF8();
    plotaid::detail::ValidatingParser parser;
    EXPECT_EQ(parser.parse(text, "broken", ChartException("broken chart", "styleimport_test", 0)), nullptr);
    if (!haveXmllint())
        GTEST_SKIP() << "xmllint is not installed";
    std::string output;
    EXPECT_NE(LintedFile(text).lint(output), 0);
    EXPECT_NE(output.find("bogus"), std::string::npos) << output;
}

} // namespace

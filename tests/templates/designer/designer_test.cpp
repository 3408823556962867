// The example templates: each sound to both validators; each applied alone to each sample chart
// prints as it did before the action kit; each designer template applies every instruction, gives a
// sound chart, applied twice restyles nothing further, and visibly does what it is for.
#include "templates/TemplateSupport.h"

#include <grx/ChartPrinter.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <set>
#include <sstream>

using namespace template_test;

namespace {

const std::vector<std::string> kDesigner{"corporate.sgt", "monochrome.sgt", "presentation.sgt"};

// File names under examples/<folder> ending with `extension`, sorted.
std::vector<std::string> exampleFiles(const std::string& folder, const std::string& extension) {
    std::vector<std::string> names;
    for (const auto& entry :
         std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/" + folder))
        if (entry.path().extension() == extension)
            names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

// FNV-1a: a digest the golden list can hold in a line per output.
std::uint64_t digest(const std::string& text) {
    std::uint64_t h = 14695981039346656037ull;
    for (unsigned char c : text)
        h = (h ^ c) * 1099511628211ull;
    return h;
}

class Designer : public TemplateTest {
protected:
    // The chart with the named example templates applied in order, in-process and without a
    // source, as the tool applies them.
    GrxVisualization& applied(const std::string& chart, const std::vector<std::string>& templates) {
        GrxVisualization& c = sample(chart);
        for (const std::string& name : templates) {
            ChartTemplate t(c, nullptr);
            EXPECT_TRUE(t.setTemplate(example("templates/" + name))) << name;
            t.applyTemplate();
        }
        return c;
    }
};

TEST_F(Designer, EveryExampleTemplateValidatesWithXercesAndXmllint) {
    const std::vector<std::string> names = exampleFiles("templates", ".sgt");
    for (const std::string& wanted : kDesigner)
        EXPECT_NE(std::find(names.begin(), names.end(), wanted), names.end()) << wanted;
    for (const std::string& name : names) {
        plotaid::detail::ValidatingParser parser;
        EXPECT_NE(
            parser.parse(example("templates/" + name), name.c_str(), ChartException("example", "test", 0)),
            nullptr)
            << name << ::testing::PrintToString(parser.lastErrors());
        if (grammar_test::haveXmllint()) {
            const grammar_test::LintResult r = grammar_test::xmllint(
                "grxml-template-3.5.xsd", std::string(PLOTAID_EXAMPLES_DIR) + "/templates/" + name);
            EXPECT_EQ(r.exitCode, 0) << name << r.output;
        }
    }
}

// Each template applied once to each chart; the printed outputs are kept as digests
// (PLOTAID_WRITE_GOLDEN=1 rewrites them).
TEST_F(Designer, OnEverySampleChartTheOutputIsKeptAndEachDesignerInstructionAppliesOnce) {
    const std::vector<std::string> charts = exampleFiles("charts", ".xml");
    ASSERT_GE(charts.size(), 15u);
    const std::string golden = std::string(PLOTAID_TEST_DATA_DIR) + "/templates/sample-outputs.txt";
    std::ostringstream now;
    for (const std::string& chart : charts)
        for (const std::string& name : exampleFiles("templates", ".sgt")) {
            SCOPED_TRACE(name + " on " + chart);
            WalkReport report;
            GrxVisualization& once = applied(chart, {name});
            std::ostringstream printed;
            ChartPrinter().Print(root(once)->getOwnerDocument(), printed);
            // Graphs in containers are left out: their output was meant to change.
            if (chart != "container-lines.xml")
                now << chart << ' ' << name << ' ' << std::hex << digest(printed.str()) << std::dec << '\n';
            if (std::find(kDesigner.begin(), kDesigner.end(), name) == kDesigner.end())
                continue;
            std::set<std::string> tags;
            for (const InstructionOutcome& o : report.outcomes()) {
                tags.insert(o.tag);
                EXPECT_EQ(o.kind, InstructionOutcome::Applied) << "#" << o.position << " " << o.tag;
            }
            EXPECT_GE(tags.size(), 3u);
            EXPECT_EQ(grammar_test::chartFaults(once), "");
            // Every instruction of these templates replaces what it sets (the one that appends
            // does so once per chart), so a second application changes nothing.
            EXPECT_NE(canonical(sample(chart)), canonical(once));
            EXPECT_EQ(canonical(applied(chart, {name, name})), canonical(once));
        }
    if (std::getenv("PLOTAID_WRITE_GOLDEN") != nullptr) {
        std::ofstream(golden) << now.str();
        GTEST_SKIP() << "wrote " << golden;
    }
    EXPECT_EQ(readAll(golden), now.str());
}

TEST_F(Designer, EachTemplateDoesWhatItIsFor) {
    const struct {
        const char *templateName, *chart, *id, *expected; // "attribute=value ..."
    } rows[] = {
        // Corporate: a bar's style is a filled area, fill its colour and stroke its colour 2. Only the
        // clustered declaration reaches a clustered graph; its width attribute replaces the range,
        // while a width in style text is the preferred width only. "normal" is the regular weight.
        {"corporate.sgt", "clustered-bar.xml", "barStyle", "color=#1F4E79 color2=#0B2540 width=80%"},
        {"corporate.sgt", "simple-bar.xml", "barStyle", "width=70%;10%;90%"},
        {"corporate.sgt", "clustered-bar.xml", "legend_1tickTextStyle", "font-weight=regular"},
        // Bins take the histogram declaration (white outline), not the bar one.
        {"corporate.sgt", "histogram.xml", "barStyle", "color2=#FFFFFF"},
        // A hinge is a filled area, a median a line.
        {"corporate.sgt", "boxplot.xml", "hingeStyle", "color=#DCE6F0 color2=#1F4E79"},
        {"corporate.sgt", "boxplot.xml", "medianStyle", "color2=#C00000"},
        // A point's style is no filled area: its own colour stays; the error bar is neither a bar
        // nor a point.
        {"corporate.sgt", "error-bars.xml", "meanStyle", "color=black color2=#FFFFFF"},
        {"corporate.sgt", "error-bars.xml", "errorbarStyle", "color2=black"},
        // The series colour of a line sits in colour 2, which the line declaration does not touch.
        {"corporate.sgt", "line-series.xml", "lineStyle", "stroke-linecap=round color2=#3E58AC"},
        // The colour aesthetic keeps the affect the chart gave it.
        {"corporate.sgt", "clustered-bar.xml", "color_1", "affect=main"},
        // Monochrome: the colour became a dash under the colour's id.
        {"monochrome.sgt", "line-series.xml", "color_1", "variable=var_region domain=domain_region"},
        // Presentation: major ticks grow, minor ticks stay.
        {"presentation.sgt", "line-series.xml", "dim_x_majorTicks", "length=8pt"},
        // Axis instructions: the axes' own style, and the tick labels' style of every axis.
        {"presentation.sgt", "scatter.xml", "tickLabelStyle", "font-size=12pt"},
        // Data labels the chart shows grow and keep apart.
        {"presentation.sgt", "pie.xml", "legendTextStyle", "font-size=12pt font-weight=bold"},
        {"presentation.sgt", "pie.xml", "interval_1", "showCollidingLabels=false"},
        {"corporate.sgt", "scatter.xml", "axisStyle", "color2=#1F4E79 stroke-width=0.75pt"},
    };
    for (const auto& row : rows) {
        const GrxVisualization& chart = applied(row.chart, {row.templateName});
        std::istringstream in(row.expected);
        for (std::string pair; in >> pair;)
            EXPECT_EQ(attr(byId(chart, row.id), pair.substr(0, pair.find('='))),
                      pair.substr(pair.find('=') + 1))
                << row.templateName << " on " << row.chart << ": " << row.id << " " << pair;
    }
    // Monochrome turns the colour into a dash; a lone line gets shape markers in the legend once,
    // and the later instructions reach them too: the shape cycle and the points' look.
    const auto count = [](const GrxVisualization& chart, const char16_t* name) {
        return root(chart)->getElementsByTagName(name)->getLength();
    };
    const GrxVisualization& mono = applied("line-series.xml", {"monochrome.sgt"});
    const GrxVisualization& twice = applied("line-series.xml", {"monochrome.sgt", "monochrome.sgt"});
    EXPECT_NE(byId<GrxDash>(mono, "color_1"), nullptr);
    EXPECT_EQ(count(twice, u"point"), 1u);
    EXPECT_EQ(count(mono, u"legendTarget"), count(sample("line-series.xml"), u"legendTarget") + 1);
    EXPECT_EQ(count(twice, u"legendTarget"), count(mono, u"legendTarget"));
    const std::vector<GrxPoint*> points = mono.getGraphs().front()->getPoints();
    ASSERT_EQ(points.size(), 1u);
    ASSERT_EQ(points.front()->getShapes().size(), 1u);
    const GrxStyleCycle* shapes = points.front()->getShapes().front()->getCycle();
    EXPECT_EQ(shapes ? describeStyles(shapes->getImplementation()) : "",
              "[({symbol=circle;}{symbol=square;}{symbol=triangle;}{glyph-angle=0;glyph-sides=5;symbol="
              "polygon;})]");
    EXPECT_EQ(attr(points.front()->getStyle(), "color2"), "#000000");
    // A scatter is not a chart of one line: no markers are added.
    EXPECT_EQ(applied("scatter.xml", {"monochrome.sgt"}).getGraphs().front()->getPoints().size(), 1u);
}

} // namespace

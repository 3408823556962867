// Each designer template applied by `plotaid apply --report` to each sample chart: every
// instruction is accounted for, none fails, the ten style and aesthetic instructions apply, and
// the chart written still validates with both validators.
#include "DesignerSupport.h"

#include "support/ToolRunner.h"

#include "foundation/ValidatingParser.h"

#include <sstream>

using namespace designer_test;
using engine_test::EngineTest;

namespace {

const std::set<std::string> kTen{
    "setColor", "setDash",  "setPattern",           "setShape",           "setSize",
    "addDash",  "addImage", "setGenericAttributes", "setShowLineMarkers", "setStyle"};

struct ReportLine {
    unsigned position = 0;
    std::string tag;
    std::string outcome; // "applied", "unsupported" or "failed: ..."
};

// Lines "<template> #<n> <tag>: <outcome>" of one template; other lines are left out.
std::vector<ReportLine> reportOf(const std::string& output, const std::string& templatePath) {
    std::vector<ReportLine> lines;
    std::istringstream in(output);
    std::string line;
    const std::string head = templatePath + " #";
    while (std::getline(in, line)) {
        if (line.compare(0, head.size(), head) != 0)
            continue;
        std::istringstream rest(line.substr(head.size()));
        ReportLine r;
        std::string tag;
        rest >> r.position >> tag;
        if (tag.empty() || tag.back() != ':')
            continue;
        r.tag = tag.substr(0, tag.size() - 1);
        std::getline(rest, r.outcome);
        if (!r.outcome.empty() && r.outcome.front() == ' ')
            r.outcome.erase(0, 1);
        lines.push_back(r);
    }
    return lines;
}

// The tags of the template's instructions, in order.
std::vector<std::string> instructionsOf(const std::string& name) {
    plotaid::detail::ValidatingParser parser;
    const auto* doc = parser.parse(engine_test::example("templates/" + name), name.c_str(),
                                   ChartException("example template", "designer_test", 0));
    std::vector<std::string> tags;
    if (doc == nullptr)
        return tags;
    for (const DOMElement* i = doc->getDocumentElement()->getFirstElementChild(); i != nullptr;
         i = i->getNextElementSibling())
        tags.push_back(text(i->getLocalName()));
    return tags;
}

class DesignerTemplateOnEveryChart : public EngineTest, public ::testing::WithParamInterface<std::string> {};

TEST_P(DesignerTemplateOnEveryChart, AppliesWithoutFailureAndTheResultValidates) {
    const std::string name = GetParam();
    const std::string templatePath = examplePath("templates/" + name);
    const std::vector<std::string> tags = instructionsOf(name);
    ASSERT_FALSE(tags.empty()) << name;
    const bool lint = haveXmllint();
    TempDir scratch;
    const std::vector<std::string> charts = exampleFiles("charts", ".xml");
    ASSERT_GE(charts.size(), 15u);
    for (const std::string& chart : charts) {
        SCOPED_TRACE(name + " on " + chart);
        const std::string out = scratch.file(chart);
        const ToolResult r =
            runTool("apply --chart " + shellQuoted(examplePath("charts/" + chart)) + " --template " +
                    shellQuoted(templatePath) + " -o " + shellQuoted(out) + " --report");
        EXPECT_EQ(r.exitCode, 0) << r.output;

        const std::vector<ReportLine> report = reportOf(r.output, templatePath);
        ASSERT_EQ(report.size(), tags.size()) << r.output;
        for (std::size_t i = 0; i < report.size(); ++i) {
            EXPECT_EQ(report[i].position, i + 1) << r.output;
            EXPECT_EQ(report[i].tag, tags[i]) << r.output;
            EXPECT_NE(report[i].outcome.compare(0, 6, "failed"), 0)
                << "#" << report[i].position << " " << report[i].tag << ": " << report[i].outcome;
            if (kTen.count(report[i].tag) != 0) {
                EXPECT_EQ(report[i].outcome, "applied") << "#" << report[i].position << " " << report[i].tag;
            }
        }

        const std::string written = readAll(out);
        ASSERT_FALSE(written.empty()) << r.output;
        plotaid::detail::ValidatingParser parser;
        EXPECT_NE(parser.parse(written, chart.c_str(), ChartException("restyled chart", "designer_test", 0)),
                  nullptr)
            << ::testing::PrintToString(parser.lastErrors());
        if (lint) {
            const LintResult l = xmllint(scratch, "grxml-2.9.xsd", out);
            EXPECT_EQ(l.exitCode, 0) << l.output;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Templates, DesignerTemplateOnEveryChart, ::testing::ValuesIn(designerTemplates()),
                         [](const ::testing::TestParamInfo<std::string>& info) {
                             return info.param.substr(0, info.param.find('.'));
                         });

// The report read above must tell a failed instruction from an applied one, or the check proves
// nothing: an id that names no style makes "setStyle" fail.
using ReportReading = EngineTest;

TEST_F(ReportReading, TellsAFailedInstructionFromAnAppliedOne) {
    TempDir scratch;
    const std::string path = scratch.file("missing-style.sgt");
    std::ofstream(path, std::ios::binary)
        << "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
           "<template xmlns=\"http://plotaid.org/grxml\" "
           "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
           "xsi:schemaLocation=\"http://plotaid.org/grxml http://plotaid.org/grxml/grxml-template-3.5.xsd\">"
           "<setStyle id=\"noSuchStyle\"><style color=\"red\"/></setStyle><setBogus/></template>";
    const ToolResult r =
        runTool("apply --chart " + shellQuoted(examplePath("charts/simple-bar.xml")) + " --template " +
                shellQuoted(path) + " -o " + shellQuoted(scratch.file("out.xml")) + " --report");
    const std::vector<ReportLine> report = reportOf(r.output, path);
    ASSERT_EQ(report.size(), 2u) << r.output;
    EXPECT_EQ(report[0].tag, "setStyle");
    EXPECT_EQ(report[1].tag, "setBogus");
    EXPECT_EQ(report[1].outcome, "unsupported");
    EXPECT_EQ(report[0].outcome.compare(0, 7, "failed:"), 0) << report[0].outcome;
}

} // namespace

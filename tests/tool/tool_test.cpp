#include "support/GrammarSupport.h"
#include "support/ToolRunner.h"

#include <gtest/gtest.h>

#include <string>

using namespace grammar_test;

namespace {

const std::string kCharts = std::string(PLOTAID_EXAMPLES_DIR) + "/charts/";
const std::string kPmml = std::string(PLOTAID_EXAMPLES_DIR) + "/pmml/credit-risk.xml";

// The commands' answers that need no files: exit code, and text that must be in the output.
TEST(Tool, CommandLinesWithoutFiles) {
    const std::vector<ToolRun> cases = {
        {"--version", 0, {"plotaid "}},
        {"--help", 0, {"usage: plotaid", "compress", "decompress"}},
        {"", 2, {}},
        {"frobnicate", 2, {"unknown command 'frobnicate'"}},
        {"time date 1582-10-15", 0, {"host value: 86400\n", "date:       1582-10-15 00:00:00\n"}},
        // Day 0 and month 13 show the day they stand for.
        {"time date '2023-13-00 23:59:59'", 0, {"date:       2023-12-31 23:59:59\n"}},
        {"time date 1970-01-01", 0, {"days since 1582-10-14: 141428\n"}},
        {"time date nonsense", 1, {"host value: missing"}},
        {"time time 10:30:15,250", 0, {"host value: 37815.25\n", "time:       10:30:15.250\n"}},
        {"time time 100:00", 0, {"time:       100:00:00\n"}},
        {"time --help", 0, {"usage: plotaid time date TEXT"}},
        {"time", 2, {}},
        {"time week 2024-01-01", 2, {}},
        {"format --type 21 --width 8 --decimals 2",
         0,
         {"host format: type 21, width 8, decimals 2\n", "  showSecond = \"true\"\n",
          "  maximumFractionDigits = \"3\"\n"}},
        {"format --type 5 --width 60 --decimals 2 --grouping", 0, {"width 40", "  useGrouping = \"true\"\n"}},
        {"format --type 5 --width 8 --decimals 2 --integer-digits 3",
         0,
         {"  minimumIntegerDigits = \"3\"\n"}},
        {"format --type 5 --width 8", 2, {}},
        {"format --type 256 --width 8 --decimals 0", 2, {}},
        {"format --type 5 --width -1 --decimals 0", 2, {}},
        {"format --type 5 --width 8 --decimals", 2, {}},
        {"format --type 5 --width 8 --decimals 1 --bogus", 2, {}},
        {"compress --help", 0, {"usage: plotaid compress IN [-o OUT]"}},
        {"decompress -h", 0, {"--limit BYTES"}},
        {"validate", 2, {}},
        {"validate --help", 0, {"usage: plotaid validate FILE..."}},
        {"text --language de --at 2026-03-04T09:05:07 '@@current_weekday@@ @@current_monthname@@ "
         ")TIME' x",
         0,
         {"Mittwoch März 9:05:07 vorm.\nx\n"}},
        {"text --at 2026-02-29T09:05:07 x", 2, {"'2026-02-29T09:05:07' is not a moment"}},
        {"text --language de --bogus x", 2, {"unknown option '--bogus'"}},
        {"text --language", 2, {"--language needs a value"}},
        {"template --help", 0, {"usage: plotaid template convert OLD [-o NEW]"}},
        {"template", 2, {"no action given (convert)"}},
        {"template upgrade x", 2, {"unknown action 'upgrade'"}},
        {"template convert", 2, {"no template given"}},
        {"template convert /nonexistent.xml", 1, {"/nonexistent.xml: cannot open"}},
        {"pack --help", 0, {"usage: plotaid pack CHART [--reference REF] [-o OUT]"}},
        {"pack", 2, {"no chart given"}},
        {"pack a b", 2, {"unexpected argument 'b'"}},
        {"pack /nonexistent.xml", 1, {"/nonexistent.xml"}},
        {"apply --help", 0, {"--pack lays out"}}};
    expectToolRuns("", cases);
}

// A file with one replacement, written to a scratch file.
std::string variant(const std::string& name, const std::string& from, const std::string& to,
                    const std::string& of = kCharts + "simple-bar.xml") {
    const std::string text = replaceOnce(readText(of), from, to);
    EXPECT_FALSE(text.empty()) << from;
    return writeScratch(name, text);
}

TEST(ToolValidate, EachFileGetsALineAndAnyFaultFailsTheRun) {
    useSourceGrammars();
    const std::string root = "<?xml version=\"1.0\"?><ROOT xmlns=\"http://plotaid.org/grxml\" "
                             "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
                             "xsi:schemaLocation=\"http://plotaid.org/grxml "
                             "http://plotaid.org/grxml/grxml-2.9.xsd\"/>";
    const std::string settings = writeScratch("tree-settings.xml", "");
    ASSERT_EQ(runTool("tree --pmml '" + kPmml + "' > '" + settings + "'").exitCode, 0);
    const std::pair<std::string, std::string> cases[] = {
        {kCharts + "pie.xml", ": valid (chart, grxml-2.9.xsd)"},
        {kPmml, ": valid (tree model, pmml-2-1.xsd)"},
        {settings, ": valid (tree display settings document, treeview-1.0.xsd)"},
        {variant("undeclared.xml", "<graph ", "<chart/><graph "), ": "},
        {variant("twice.xml", "<sourceVariable id=\"var_gender\"", "<sourceVariable id=\"var_jobcat\""),
         ": id 'var_jobcat' is used more than once"},
        {variant("bad-tree.xml", "<Header ", "<Bogus/><Header ", kPmml), ": "},
        // "graph" is declared by the chart grammar too, but a graph root is an older chart.
        {writeScratch("graph-root.xml", replaceOnce(root, "ROOT", "graph")),
         ": an older chart must name its grammar grxml-1.4.xsd (it names grxml-2.9.xsd)"},
        {writeScratch("style-root.xml", replaceOnce(root, "ROOT", "style id=\"s\"")), ": "},
        {"/nonexistent/chart.xml", ": cannot open"},
    };
    std::string all = "validate";
    for (const auto& [file, line] : cases) {
        SCOPED_TRACE(file);
        const ToolResult r = runTool("validate '" + file + "'");
        EXPECT_EQ(r.exitCode, line.rfind(": valid", 0) == 0 ? 0 : 1) << r.output;
        EXPECT_TRUE(outputHas(r, file + line)) << r.output;
        all += " '" + file + "'";
    }
    const ToolResult r = runTool(all);
    EXPECT_EQ(r.exitCode, 1);
    EXPECT_TRUE(outputHas(r, "'chart'") && outputHas(r, "Bogus") && outputHas(r, "root element 'style'"))
        << r.output;
    EXPECT_TRUE(outputHas(r, kCharts + "pie.xml: valid") && outputHas(r, settings + ": valid")) << r.output;
    EXPECT_EQ(runTool("validate '" + kCharts + "pie.xml' '" + kCharts + "boxplot.xml'").exitCode, 0);
}

// The converted template goes to the file named, and is one the library reads; a template of the
// current form or one that is not XML is refused with the reason.
TEST(ToolTemplate, ConvertsEarlierFormsOnly) {
    useSourceGrammars();
    const std::string earlier = std::string(PLOTAID_EXAMPLES_DIR) + "/templates/earlier/axes.xml";
    const std::string out = writeScratch("converted.sgt", ""), broken = writeScratch("broken.xml", "<graph>");
    expectToolRuns("", {{"template convert '" + earlier + "' -o '" + out + "'", 0, {}},
                        {"validate '" + out + "'", 0, {": valid (template, grxml-template-1.0.xsd)"}},
                        {"template convert '" + out + "'", 1, {"of the current form already"}},
                        {"template convert '" + broken + "'", 1, {"broken.xml:1:8: "}}});
    EXPECT_NE(readText(out).find("<setAxisMajorTicks"), std::string::npos);
}

// The packed chart packs to itself; "apply --pack" packs after the templates.
TEST(ToolPack, PacksTheChartAndAfterTemplates) {
    useSourceGrammars();
    const std::string chart = kCharts + "histogram.xml", out = writeScratch("packed.xml", "");
    const std::string attached = "part=\"bottom\" target=\"frame_footnote_2\"";
    ASSERT_EQ(runTool("pack '" + chart + "' -o '" + out + "'").exitCode, 0);
    EXPECT_NE(readText(out).find(attached), std::string::npos);
    EXPECT_EQ(runTool("pack '" + out + "' --reference '" + chart + "'").output, readText(out));
    const std::string tidy = std::string(PLOTAID_EXAMPLES_DIR) + "/templates/bar-tidy.sgt";
    for (const bool pack : {false, true}) {
        const ToolResult r =
            runTool("apply --chart '" + chart + "' --template '" + tidy + "'" + (pack ? " --pack" : ""));
        EXPECT_EQ(r.exitCode, 0) << r.output;
        EXPECT_EQ(outputHas(r, attached), pack);
    }
}

// Popups from the command line: once per chart, with or without templates.
TEST(ToolApply, PopupsOncePerChart) {
    const std::string out = writeScratch("with-popups.xml", "");
    expectToolRuns("apply ", {{"--chart " + kCharts + "scatter.xml --popups -o " + out, 0, {}}});
    const std::string chart = readText(out);
    EXPECT_NE(chart.find("tokenTemplate=\"Beginning Salary = $[1]$"), std::string::npos)
        << chart.substr(0, 300);
    expectToolRuns("apply ", {{"--chart " + out + " --popups -o " + out, 1, {"the chart has popups already"}},
                              {"--help", 0, {"--popups"}},
                              {"--chart " + out, 2, {}}});
}

} // namespace

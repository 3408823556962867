#include "foundation/FoundationSupport.h"
#include "support/GrammarSupport.h"
#include "support/ToolRunner.h"
#include "templates/InstructionWalk.h"

#include <plotaid/ChartTemplate.h>
#include <plotaid/ChartTransformer.h>

#include <algorithm>
#include <fstream>
#include <thread>

using namespace foundation_test;
using engine_test::example;

namespace {

const std::string kCharts = std::string(PLOTAID_EXAMPLES_DIR) + "/charts/";

std::string restyled(const std::string& chartText) {
    ChartTransformer t(chartText);
    return t.applyTemplate(example("templates/presentation.sgt")) ? t.getXML() : "not applied";
}

using TemplatesAsWritten = engine_test::EngineTest;

// A template is the current form by its root and instructions, schema line or not; text that is not
// XML says where it stops being XML.
TEST_F(TemplatesAsWritten, NeedNoSchemaLineAndTextThatIsNotXmlFailsWithTheParsersWords) {
    const std::string bare = withoutSchemaLine(example("templates/bar-tidy.sgt"));
    const std::pair<std::string, std::size_t> rows[] = {
        {bare, 6},
        {std::regex_replace(bare, std::regex(R"(\s+xmlns:xsi="[^"]*")"), ""), 6},
        // No instruction: the earlier form, converted.
        {"<template xmlns=\"http://plotaid.org/grxml\"><madeUp/></template>", 0},
        {"<template xmlns=\"http://plotaid.org/other\"><setStyle type=\"bar\"/></template>", 0}};
    for (const auto& [text, instructions] : rows) {
        SCOPED_TRACE(text.substr(0, 200));
        engine_test::Chart chart = engine_test::Chart::parse(example("charts/simple-bar.xml"));
        ChartTemplate t(*chart.vis, nullptr);
        plotaid::detail::WalkReport report;
        EXPECT_TRUE(t.setTemplate(text));
        t.applyTemplate();
        EXPECT_EQ(report.outcomes().size(), instructions);
    }
    TempDir dir;
    std::ofstream(dir.file("notxml.txt")) << "<template>\n  this is <not XML";
    const ToolResult single =
        runTool("apply --chart " + kCharts + "pie.xml --template " + dir.file("notxml.txt"));
    EXPECT_EQ(single.exitCode, 1);
    EXPECT_NE(single.output.find("notxml.txt:2:19: equal sign expected"), std::string::npos) << single.output;
}

// The batch form writes each chart as the single form does, and one line per chart that failed.
TEST(ToolBatch, RestylesEveryChartIntoTheFolderAndNamesTheFailures) {
    TempDir dir;
    const std::string tmpl =
        " --template " + std::string(PLOTAID_EXAMPLES_DIR) + "/templates/presentation.sgt";
    std::ofstream(dir.file("broken.xml")) << "<visualization";
    const ToolResult batch = runTool("apply" + tmpl + " -o " + dir.file("out") + " -j 2 " + kCharts +
                                     "pie.xml " + dir.file("broken.xml") + " " + kCharts + "simple-bar.xml");
    EXPECT_EQ(batch.exitCode, 1) << batch.output;
    EXPECT_EQ(std::count(batch.output.begin(), batch.output.end(), '\n'), 1) << batch.output;
    EXPECT_NE(batch.output.find("broken.xml"), std::string::npos) << batch.output;
    for (const char* name : {"pie.xml", "simple-bar.xml"}) {
        EXPECT_EQ(runTool("apply --chart " + kCharts + name + tmpl + " -o " + dir.file(name)).exitCode, 0);
        EXPECT_EQ(readAll(dir.file("out/" + std::string(name))), readAll(dir.file(name))) << name;
    }
    EXPECT_FALSE(std::filesystem::exists(dir.file("out/broken.xml")));
    EXPECT_EQ(runTool("apply" + tmpl + " -o " + dir.file("out") + " -j 2 " + kCharts + "pie.xml").exitCode,
              0);
}

// One transformer per thread: four threads over the sample charts give the single-thread output.
TEST(Threads, FourTransformersAtOnceWriteWhatOneWrites) {
    const std::vector<std::string> names = grammar_test::sampleCharts();
    std::vector<std::string> texts, expected;
    for (const std::string& n : names) {
        texts.push_back(readAll(n));
        expected.push_back(restyled(texts.back()));
    }
    std::vector<std::vector<std::string>> got(4, std::vector<std::string>(names.size()));
    std::vector<std::thread> threads;
    for (std::size_t t = 0; t < got.size(); ++t)
        threads.emplace_back([&, t] {
            engine_test::Records own;
            for (std::size_t i = 0; i < names.size(); ++i) {
                const std::size_t at = (i + t * 3) % names.size(); // each thread starts elsewhere
                got[t][at] = restyled(texts[at]);
            }
        });
    for (std::thread& t : threads)
        t.join();
    for (std::size_t t = 0; t < got.size(); ++t)
        for (std::size_t i = 0; i < names.size(); ++i)
            EXPECT_EQ(got[t][i], expected[i]) << names[i] << " on thread " << t;
}

} // namespace

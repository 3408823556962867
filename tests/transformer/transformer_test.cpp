#include "TransformerSupport.h"

#include <plotaid/VarDataProcessor.h>

#include <xercesc/dom/DOM.hpp>

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <memory>
#include <type_traits>

using namespace transformer_test;

namespace {

const char* const kSamples[] = {"area.xml",
                                "bar-3d.xml",
                                "boxplot.xml",
                                "clustered-bar.xml",
                                "dual-y-axis.xml",
                                "error-bars.xml",
                                "histogram.xml",
                                "line-series.xml",
                                "panels.xml",
                                "pie.xml",
                                "population-pyramid.xml",
                                "scatter.xml",
                                "scatterplot-matrix.xml",
                                "simple-bar.xml",
                                "stacked-bar.xml"};

// The original chart with its embedded sources moved behind everything else: the one reordering
// that a round trip through the transformer makes.
std::string withEmbeddedSourcesLast(const std::string& chart) {
    Parsed original(chart);
    EXPECT_TRUE(original.ok());
    auto* root = original.root();
    std::vector<XERCES_CPP_NAMESPACE::DOMNode*> moved;
    for (auto* e = root->getFirstElementChild(); e != nullptr; e = e->getNextElementSibling())
        if (ChartString(e->getLocalName()) == ChartString(u"embeddedSource"))
            moved.push_back(e);
    for (auto* e : moved)
        root->appendChild(root->removeChild(e));
    return original.vis->AsUTF8();
}

std::unique_ptr<unsigned char[]> copyOf(const std::string& bytes) {
    std::unique_ptr<unsigned char[]> out(new unsigned char[bytes.size()]);
    std::memcpy(out.get(), bytes.data(), bytes.size());
    return out;
}

} // namespace

// ---- plain chart in: sources leave the chart and come back ------------------------------------------

TEST_F(TransformerTest, EmbeddedSourceBecomesAReferenceAndTheDataHoldsIt) {
    ChartTransformer t(example("charts/area.xml"));
    ASSERT_NE(t.getVisualization(), nullptr);

    Parsed chart(t.getXML());
    ASSERT_TRUE(chart.ok());
    EXPECT_TRUE(chart.idsOf(u"embeddedSource").empty());
    EXPECT_EQ(chart.idsOf(u"userSource"), std::vector<std::string>{"rain"});

    Parsed data(inflate(t.getCompressedData()));
    ASSERT_TRUE(data.ok()) << (data.errors.empty() ? "" : data.errors.front());
    EXPECT_EQ(ChartString(data.root()->getLocalName()).toUTF8(), "graphSources");
    EXPECT_EQ(ChartString(data.root()->getNamespaceURI()).toUTF8(), "http://plotaid.org/grxml/data");
    EXPECT_EQ(data.idsOf(u"embeddedSource"), std::vector<std::string>{"rain"});
    // The rows travel whole.
    EXPECT_EQ(data.root()->getFirstElementChild()->getElementsByTagNameNS(u"*", u"row")->getLength(),
              Parsed(example("charts/area.xml")).root()->getElementsByTagNameNS(u"*", u"row")->getLength());
}

TEST_F(TransformerTest, EveryEntireDocumentEqualsItsOriginalUpToTheSourceOrder) {
    for (const char* name : kSamples) {
        SCOPED_TRACE(name);
        const std::string original = example(std::string("charts/") + name);
        ASSERT_FALSE(original.empty());
        ChartTransformer t(original);
        ASSERT_NE(t.getVisualization(), nullptr);
        EXPECT_EQ(t.getEntireXML(u"UTF-8"), withEmbeddedSourcesLast(original));
    }
}

TEST_F(TransformerTest, ChartWithoutSourcesHasNoData) {
    Parsed area(example("charts/area.xml"));
    ASSERT_TRUE(area.ok());
    area.vis->removeEmbeddedSources();
    ChartTransformer t(area.vis->AsUTF8());
    ASSERT_NE(t.getVisualization(), nullptr);
    EXPECT_EQ(t.getEntireXML(u"UTF-8"), t.getXML());
    EXPECT_TRUE(t.getCompressedData().empty());
    unsigned length = 99;
    EXPECT_EQ(t.getCompressedDataStream(length), nullptr);
    EXPECT_EQ(length, 0u);
}

TEST_F(TransformerTest, CompressedChartAndDataRoundTrip) {
    ChartTransformer first(example("charts/simple-bar.xml"));
    const std::string chart = first.getCompressedXML();
    const std::string data = first.getCompressedData();
    ASSERT_EQ(static_cast<unsigned char>(chart.at(0)), 0x78);
    ChartTransformer second(chart, data);
    ASSERT_NE(second.getVisualization(), nullptr);
    EXPECT_EQ(second.getXML(), first.getXML());
    EXPECT_EQ(second.getEntireXML(u"UTF-8"), first.getEntireXML(u"UTF-8"));
    EXPECT_EQ(second.getCompressedData(), data);
}

TEST_F(TransformerTest, ReferenceWithoutSourceLeavesTheEntireDocument) {
    ChartTransformer first(example("charts/area.xml"));
    Parsed chart(first.getXML());
    ASSERT_TRUE(chart.ok());
    chart.vis->addUserSource().setId(ChartString("elsewhere"));
    ChartTransformer second(deflate(chart.vis->AsUTF8()), first.getCompressedData());
    Parsed entire(second.getEntireXML(u"UTF-8"));
    ASSERT_TRUE(entire.ok());
    EXPECT_TRUE(entire.idsOf(u"userSource").empty());
    EXPECT_EQ(entire.idsOf(u"embeddedSource"), std::vector<std::string>{"rain"});
}

// ---- chart with a data stream ---------------------------------------------------------------------

TEST_F(TransformerTest, StreamComesBackIdenticalAndConvertsOnceToData) {
    const std::string stream = readAll(std::string(PLOTAID_EXAMPLES_DIR) + "/data/area.stream");
    ASSERT_FALSE(stream.empty());
    auto bytes = copyOf(stream);
    ChartTransformer split(example("charts/area.xml"));
    ChartTransformer t(split.getCompressedXML(), bytes.get(), static_cast<unsigned>(stream.size()));
    ASSERT_NE(t.getVisualization(), nullptr);

    unsigned length = 0;
    std::unique_ptr<unsigned char[]> back(t.getCompressedDataStream(length));
    ASSERT_NE(back, nullptr);
    EXPECT_EQ(std::string(reinterpret_cast<const char*>(back.get()), length), stream);
    EXPECT_NE(back.get(), bytes.get());

    Parsed entire(t.getEntireXML(u"UTF-8"));
    ASSERT_TRUE(entire.ok());
    EXPECT_EQ(entire.idsOf(u"embeddedSource"), std::vector<std::string>{"rain"});

    const std::string data = t.getCompressedData();
    ASSERT_FALSE(data.empty());
    Parsed parsedData(inflate(data));
    ASSERT_TRUE(parsedData.ok());
    EXPECT_EQ(parsedData.idsOf(u"embeddedSource"), std::vector<std::string>{"rain"});
    // Held from now on: the stream is no longer read.
    std::memset(bytes.get(), 0, stream.size());
    EXPECT_EQ(t.getCompressedData(), data);
}

TEST_F(TransformerTest, DataFromCompressedDocumentGivesAStream) {
    ChartTransformer t(example("charts/area.xml"));
    unsigned length = 0;
    std::unique_ptr<unsigned char[]> stream(t.getCompressedDataStream(length));
    ASSERT_NE(stream, nullptr);
    ASSERT_GT(length, 0u);
    // The stream holds the same data: converted back, it gives the same source.
    ChartTransformer again(t.getCompressedXML(), stream.get(), length);
    Parsed a(t.getEntireXML(u"UTF-8")), b(again.getEntireXML(u"UTF-8"));
    ASSERT_TRUE(a.ok());
    ASSERT_TRUE(b.ok());
    auto rows = [](const Parsed& p) { return p.root()->getElementsByTagNameNS(u"*", u"row")->getLength(); };
    EXPECT_EQ(rows(a), rows(b));
    EXPECT_GT(rows(a), 0u);
}

TEST_F(TransformerTest, SourceNameThatIsNotAnXmlNameIsRefusedWithARecord) {
    VarDataProcessor store;
    store.AddDataSource("my data", 1);
    store.AddVariable("my data", "v");
    store.SetVariableValue("my data", "v", 0, 1.5);
    unsigned length = 0;
    std::unique_ptr<unsigned char[]> stream(store.GetDataStream(length));
    ASSERT_NE(stream, nullptr);
    ChartTransformer split(example("charts/area.xml"));
    ChartTransformer t(split.getCompressedXML(), stream.get(), length);
    Records records;
    EXPECT_TRUE(t.getCompressedData().empty());
    EXPECT_TRUE(records.mentions("not an XML name")) << ::testing::PrintToString(records.messages());
    // The stream itself is still handed back untouched.
    unsigned back = 0;
    std::unique_ptr<unsigned char[]> copy(t.getCompressedDataStream(back));
    EXPECT_EQ(back, length);
}

// ---- bad input ------------------------------------------------------------------------------------

TEST_F(TransformerTest, TransformerWithoutChartAnswersEmpty) {
    const std::string plain = example("charts/area.xml");
    std::vector<std::unique_ptr<ChartTransformer>> broken;
    broken.push_back(std::make_unique<ChartTransformer>(std::string()));
    broken.push_back(std::make_unique<ChartTransformer>("<visualization/>"));
    broken.push_back(std::make_unique<ChartTransformer>(plain, std::string())); // not compressed
    broken.push_back(std::make_unique<ChartTransformer>(std::string("x\x9c garbage", 10), std::string()));
    const std::string whole = deflate(plain);
    broken.push_back(std::make_unique<ChartTransformer>(whole.substr(0, whole.size() / 2), std::string()));
    broken.push_back(std::make_unique<ChartTransformer>(deflate("<visualization"), std::string()));
    broken.push_back(std::make_unique<ChartTransformer>(whole.substr(0, 20), nullptr, 0u));
    // A data document is valid XML but no chart.
    ChartTransformer source(plain);
    broken.push_back(std::make_unique<ChartTransformer>(inflate(source.getCompressedData())));
    for (std::size_t i = 0; i < broken.size(); ++i) {
        SCOPED_TRACE(i);
        ChartTransformer& t = *broken[i];
        EXPECT_EQ(t.getVisualization(), nullptr);
        EXPECT_TRUE(t.getXML().empty());
        EXPECT_TRUE(t.getEntireXML(u"UTF-8").empty());
        EXPECT_FALSE(t.applyTemplate(example("templates/bar-tidy.sgt")));
        EXPECT_EQ(t.addPopups(), 0u);
        EXPECT_EQ(inflate(t.getCompressedXML()), "");
    }
}

TEST_F(TransformerTest, ChartThatInflatesPastTheCapIsRefused) {
    const std::string compressed = deflate(example("charts/area.xml"));
    const std::size_t saved = zpack::decompressionLimit();
    zpack::setDecompressionLimit(1000);
    ChartTransformer t(compressed, std::string());
    zpack::setDecompressionLimit(saved);
    EXPECT_EQ(t.getVisualization(), nullptr);
    ChartTransformer fine(compressed, std::string());
    EXPECT_NE(fine.getVisualization(), nullptr);
}

TEST_F(TransformerTest, DataThatIsNotADataDocumentLeavesTheChartAlone) {
    ChartTransformer split(example("charts/area.xml"));
    const std::string chart = split.getCompressedXML();
    const std::string bad[] = {std::string("x\x9c not zlib", 11), deflate("<graphSources"),
                               deflate(example("charts/area.xml")), split.getCompressedData().substr(0, 30)};
    for (const std::string& data : bad) {
        ChartTransformer t(chart, data);
        ASSERT_NE(t.getVisualization(), nullptr);
        EXPECT_EQ(t.getEntireXML(u"UTF-8"), t.getXML());
        unsigned length = 7;
        std::unique_ptr<unsigned char[]> stream(t.getCompressedDataStream(length));
        EXPECT_EQ(stream == nullptr, length == 0u);
    }
    Records records;
    ChartTransformer chartAsData(chart, deflate(example("charts/area.xml")));
    chartAsData.getEntireXML(u"UTF-8");
    EXPECT_TRUE(records.mentions("not a data document"));
}

TEST_F(TransformerTest, GarbageStreamGivesNoDataAndNoCrash) {
    const unsigned char junk[] = {1, 2, 3, 4, 5, 6, 7, 8, 0xff, 0xff, 0xff, 0xff};
    ChartTransformer split(example("charts/area.xml"));
    ChartTransformer t(split.getCompressedXML(), junk, sizeof junk);
    ASSERT_NE(t.getVisualization(), nullptr);
    EXPECT_EQ(t.getEntireXML(u"UTF-8"), t.getXML());
    EXPECT_TRUE(t.getCompressedData().empty());
}

// ---- templates and popups -------------------------------------------------------------------------

TEST_F(TransformerTest, TemplateThatCannotBeReadIsAFailure) {
    ChartTransformer t(example("charts/simple-bar.xml"));
    const std::string before = t.getXML();
    EXPECT_FALSE(t.applyTemplate("<template xmlns=\"http://plotaid.org/grxml\" "
                                 "xsi:schemaLocation=\"http://plotaid.org/grxml grxml-template-3.5.xsd\">"));
    EXPECT_EQ(t.getXML(), before);
    EXPECT_TRUE(t.applyTemplate(example("templates/bar-tidy.sgt")));
}

TEST_F(TransformerTest, PopupsAreAddedOnceOnly) {
    ChartTransformer t(example("charts/simple-bar.xml"));
    ASSERT_NE(t.getVisualization(), nullptr);
    ASSERT_TRUE(t.getVisualization()->getPopups().empty());
    EXPECT_EQ(t.addPopups(), 1u); // the instruction has no action yet, and still 1

    Parsed chart(example("charts/simple-bar.xml"));
    ASSERT_NE(chart.vis->getElementById(u"interval_1"), nullptr);
    chart.vis->addPopup().SetAttribute(u"target", u"interval_1");
    ChartTransformer withPopups(chart.vis->AsUTF8());
    const std::string before = withPopups.getXML();
    EXPECT_EQ(withPopups.addPopups(), 0u);
    EXPECT_EQ(withPopups.getXML(), before);
}

TEST_F(TransformerTest, TemplateDumpsShareOneCounter) {
    TempDir dir;
    ScopedEnv path("DumpChartXMLPath", dir.path());
    ScopedEnv options("DumpChartXMLOptions", "0000111000");
    ChartTransformer t(example("charts/simple-bar.xml"));
    ASSERT_TRUE(t.applyTemplate(example("templates/bar-tidy.sgt")));
    t.applyTemplate(example("templates/bar-tidy.sgt"));
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(dir.path()))
        if (entry.path().extension() != ".log")
            names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    ASSERT_EQ(names.size(), 6u) << ::testing::PrintToString(names);
    // Whatever this process did before, the two applications carry consecutive numbers.
    const std::string first = names[0].substr(std::strlen("Template_"), 2);
    const int n = std::stoi(first);
    char second[16];
    std::snprintf(second, sizeof second, "%02d", n + 1);
    const std::vector<std::string> expected = {"Template_" + first + ".sgt",
                                               std::string("Template_") + second + ".sgt",
                                               "Xml_after_template_" + first + ".xml",
                                               std::string("Xml_after_template_") + second + ".xml",
                                               "Xml_before_template_" + first + ".xml",
                                               std::string("Xml_before_template_") + second + ".xml"};
    EXPECT_EQ(names, expected);
    // The before-dump is the whole document, with its data.
    Parsed before(readAll(dir.file("Xml_before_template_" + first + ".xml")));
    ASSERT_TRUE(before.ok());
    EXPECT_FALSE(before.idsOf(u"embeddedSource").empty());
}

TEST_F(TransformerTest, EntireDocumentLeavesTheChartAsItWas) {
    ChartTransformer t(example("charts/area.xml"));
    ASSERT_NE(t.getVisualization(), nullptr);
    // A reference that no source answers, made after the data was taken.
    t.getVisualization()->addUserSource().setId(ChartString("late"));
    const std::string before = t.getXML();
    Parsed entire(t.getEntireXML(u"UTF-8"));
    ASSERT_TRUE(entire.ok());
    EXPECT_TRUE(entire.idsOf(u"userSource").empty());
    EXPECT_EQ(entire.idsOf(u"embeddedSource"), std::vector<std::string>{"rain"});
    EXPECT_EQ(t.getXML(), before);
    // The sources are found again the next time.
    EXPECT_EQ(t.getEntireXML(u"UTF-8"), entire.vis->AsUTF8());
    EXPECT_NE(t.getVisualization()->getElementById(u"late"), nullptr);
}

TEST_F(TransformerTest, SourceAskedForTwiceComesBackTwiceAndTheReferencesStay) {
    ChartTransformer t(example("charts/area.xml"));
    ASSERT_NE(t.getVisualization(), nullptr);
    t.getVisualization()->addUserSource().SetAttribute(u"id", u"rain");
    t.getEntireXML(u"UTF-8");
    // Both references are still in the chart afterwards, whatever the duplicate id does to validity.
    const std::string text = t.getXML();
    std::size_t count = 0;
    for (std::size_t at = text.find("<userSource"); at != std::string::npos;
         at = text.find("<userSource", at + 1))
        ++count;
    EXPECT_EQ(count, 2u);
    const std::string whole = t.getEntireXML(u"UTF-8");
    std::size_t sources = 0;
    for (std::size_t at = whole.find("<embeddedSource"); at != std::string::npos;
         at = whole.find("<embeddedSource", at + 1))
        ++sources;
    EXPECT_EQ(sources, 2u);
}

// A transformer owns its visualization: no copy may share it.
static_assert(!std::is_copy_constructible_v<ChartTransformer>);
static_assert(!std::is_copy_assignable_v<ChartTransformer>);

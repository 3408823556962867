#include "TransformerSupport.h"

#include <grx/ChartPrinter.h>

#include <xercesc/dom/DOM.hpp>

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <memory>
#include <sstream>
#include <type_traits>

using namespace transformer_test;

namespace {

const std::vector<std::string> kRain{"rain"};

// A transformer owns its visualization: no copy may share it.
static_assert(!std::is_copy_constructible_v<ChartTransformer> &&
              !std::is_copy_assignable_v<ChartTransformer>);

// The one reordering a round trip makes: embedded sources move behind everything else.
TEST_F(TransformerTest, EveryEntireDocumentIsItsOriginalWithTheSourcesLast) {
    for (const std::string& path : grammar_test::sampleCharts()) {
        SCOPED_TRACE(path);
        Parsed original(readAll(path));
        ASSERT_TRUE(original.ok());
        std::vector<XERCES_CPP_NAMESPACE::DOMElement*> sources;
        for (auto* e = original.root()->getFirstElementChild(); e; e = e->getNextElementSibling())
            if (ChartString(e->getLocalName()) == ChartString(u"embeddedSource"))
                sources.push_back(e);
        for (auto* e : sources)
            original.root()->appendChild(original.root()->removeChild(e));
        EXPECT_EQ(ChartTransformer(readAll(path)).getEntireXML(u"UTF-8"), original.vis->AsUTF8());
    }
}

TEST_F(TransformerTest, EmbeddedSourceLeavesTheChartForTheDataAndBothComeBackCompressed) {
    ChartTransformer first(example("charts/area.xml"));
    Parsed chart(first.getXML());
    ASSERT_TRUE(chart.ok());
    EXPECT_TRUE(chart.idsOf(u"embeddedSource").empty());
    EXPECT_EQ(chart.idsOf(u"userSource"), kRain);
    const std::string compressed = first.getCompressedXML(), data = first.getCompressedData();
    EXPECT_EQ(Parsed(inflate(data)).idsOf(u"embeddedSource"), kRain);
    ASSERT_EQ(static_cast<unsigned char>(compressed.at(0)), 0x78);
    ChartTransformer second(compressed, data);
    EXPECT_EQ(second.getXML(), first.getXML());
    EXPECT_EQ(second.getEntireXML(u"UTF-8"), first.getEntireXML(u"UTF-8"));
    EXPECT_EQ(second.getCompressedData(), data);
}

TEST_F(TransformerTest, EntireDocumentDropsUnansweredReferencesButLeavesTheChart) {
    ChartTransformer t(example("charts/area.xml"));
    ASSERT_NE(t.getVisualization(), nullptr);
    t.getVisualization()->addUserSource().setId(ChartString("late")); // made after the data was taken
    const std::string before = t.getXML();
    Parsed entire(t.getEntireXML(u"UTF-8"));
    ASSERT_TRUE(entire.ok());
    EXPECT_TRUE(entire.idsOf(u"userSource").empty());
    EXPECT_EQ(entire.idsOf(u"embeddedSource"), kRain);
    EXPECT_EQ(t.getXML(), before);
    EXPECT_EQ(t.getEntireXML(u"UTF-8"),
              entire.vis->AsUTF8()); // found again the next time
    // A source asked for twice comes back twice, and both references stay.
    t.getVisualization()->addUserSource().SetAttribute(u"id", u"rain");
    EXPECT_EQ(count(t.getEntireXML(u"UTF-8"), "<embeddedSource"), 2u);
    EXPECT_EQ(count(t.getXML(), "<userSource"), 3u);
}

// A declaration that repeats the one in scope is dropped by the printer, whoever made the document.
TEST_F(TransformerTest, PrintedDataDeclareTheChartNamespaceOnce) {
    const std::string ns = "xmlns=\"http://plotaid.org/grxml\"";
    std::string data = inflate(ChartTransformer(example("charts/area.xml")).getCompressedData());
    EXPECT_EQ(count(data, ns), 1u);
    data.replace(data.find("<embeddedSource"), 15, "<embeddedSource " + ns);
    Parsed parsed(data);
    ASSERT_TRUE(parsed.ok());
    std::ostringstream printed;
    ChartPrinter().Print(parsed.root()->getOwnerDocument(), printed);
    EXPECT_EQ(count(printed.str(), ns), 1u) << printed.str();
    EXPECT_EQ(count(printed.str(), "<embeddedSource"), 1u);
}

TEST_F(TransformerTest, StreamComesBackIdenticalAndConvertsOnceToData) {
    const std::string stream = example("data/area.stream");
    ASSERT_FALSE(stream.empty());
    std::unique_ptr<unsigned char[]> bytes(new unsigned char[stream.size()]);
    std::memcpy(bytes.get(), stream.data(), stream.size());
    ChartTransformer split(example("charts/area.xml"));
    ChartTransformer t(split.getCompressedXML(), bytes.get(), static_cast<unsigned>(stream.size()));
    ASSERT_NE(t.getVisualization(), nullptr);
    unsigned length = 0;
    std::unique_ptr<unsigned char[]> back(t.getCompressedDataStream(length));
    ASSERT_NE(back, nullptr);
    EXPECT_EQ(std::string(reinterpret_cast<const char*>(back.get()), length), stream);
    EXPECT_EQ(Parsed(t.getEntireXML(u"UTF-8")).idsOf(u"embeddedSource"), kRain);
    const std::string data = t.getCompressedData();
    EXPECT_EQ(Parsed(inflate(data)).idsOf(u"embeddedSource"), kRain);
    std::memset(bytes.get(), 0,
                stream.size()); // held from now on: the stream is not read again
    EXPECT_EQ(t.getCompressedData(), data);
    // And the other way: data held as a document is handed out as a stream holding the same rows, under
    // a source id that is no XML name too (the chart's parse lets it pass, so its data must).
    ChartTransformer spaced(areaWithSpacedSource());
    std::unique_ptr<unsigned char[]> made(spaced.getCompressedDataStream(length));
    ASSERT_NE(made, nullptr);
    ChartTransformer again(spaced.getCompressedXML(), made.get(), length);
    EXPECT_EQ(count(inflate(again.getCompressedData()), "<row>"), 54u);
    EXPECT_EQ(count(again.getEntireXML(u"UTF-8"), "<row>"), 54u);
    ChartTransformer joined(spaced.getCompressedXML(), spaced.getCompressedData());
    EXPECT_EQ(count(joined.getEntireXML(u"UTF-8"), "<row>"), 54u);
}

TEST_F(TransformerTest, TransformerWithoutChartAnswersEmpty) {
    const std::string plain = example("charts/area.xml"), whole = deflate(plain);
    const std::string data = inflate(ChartTransformer(plain).getCompressedData()); // valid XML, no chart
    const std::pair<std::string, const char*> compressedCharts[] = {
        {plain, "not compressed"},
        {std::string("x\x9c garbage", 10), "not zlib"},
        {whole.substr(0, whole.size() / 2), "cut"},
        {deflate("<visualization"), "not XML"},
    };
    std::vector<std::unique_ptr<ChartTransformer>> broken;
    for (const std::string& text : {std::string(), std::string("<visualization/>"), data})
        broken.push_back(std::make_unique<ChartTransformer>(text));
    for (const auto& [text, what] : compressedCharts)
        broken.push_back(std::make_unique<ChartTransformer>(text, std::string()));
    broken.push_back(std::make_unique<ChartTransformer>(whole.substr(0, 20), nullptr, 0u));
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
    const std::size_t saved = zpack::decompressionLimit();
    zpack::setDecompressionLimit(1000);
    ChartTransformer capped(whole, std::string());
    zpack::setDecompressionLimit(saved);
    EXPECT_EQ(capped.getVisualization(), nullptr);
    EXPECT_NE(ChartTransformer(whole, std::string()).getVisualization(), nullptr);
}

// Data that cannot be read, or none at all, leaves the chart as it is.
TEST_F(TransformerTest, ChartsWithoutUsableDataKeepTheirText) {
    ChartTransformer split(example("charts/area.xml"));
    const std::string chart = split.getCompressedXML();
    Parsed area(example("charts/area.xml"));
    ASSERT_TRUE(area.ok());
    area.vis->removeEmbeddedSources();
    const unsigned char junk[] = {1, 2, 3, 4, 5, 6, 7, 8, 0xff, 0xff, 0xff, 0xff};
    std::vector<std::unique_ptr<ChartTransformer>> charts;
    charts.push_back(std::make_unique<ChartTransformer>(area.vis->AsUTF8())); // no sources
    charts.push_back(std::make_unique<ChartTransformer>(chart, junk, sizeof junk));
    for (const std::string& data :
         {std::string("x\x9c not zlib", 11), deflate("<graphSources"),
          split.getCompressedData().substr(0, 30), deflate(example("charts/area.xml"))})
        charts.push_back(std::make_unique<ChartTransformer>(chart, data));
    for (std::size_t i = 0; i < charts.size(); ++i) {
        SCOPED_TRACE(i);
        ChartTransformer& t = *charts[i];
        ASSERT_NE(t.getVisualization(), nullptr);
        EXPECT_EQ(t.getEntireXML(u"UTF-8"), t.getXML());
        unsigned length = 7;
        std::unique_ptr<unsigned char[]> stream(t.getCompressedDataStream(length));
        EXPECT_EQ(stream == nullptr, length == 0u);
        EXPECT_TRUE(i > 1 || t.getCompressedData().empty());
        EXPECT_TRUE(i > 0 || stream == nullptr);
    }
    engine_test::Records records; // a chart where the data belongs
    EXPECT_EQ(ChartTransformer(chart, deflate(example("charts/area.xml"))).getEntireXML(u"UTF-8"),
              ChartTransformer(chart, std::string()).getXML());
    EXPECT_EQ(records.errors().at(0), "getDataDocument: the data is not a data document");
}

TEST_F(TransformerTest, TemplatesAndPopups) {
    ChartTransformer t(example("charts/simple-bar.xml"));
    const std::string before = t.getXML();
    EXPECT_FALSE(t.applyTemplate("<template xmlns=\"http://plotaid.org/grxml\" "
                                 "xsi:schemaLocation=\"http://plotaid.org/grxml grxml-template-3.5.xsd\">"));
    EXPECT_EQ(t.getXML(), before);
    EXPECT_EQ(t.addPopups(), 1u);
    EXPECT_NE(t.getXML().find("tokenTemplate=\"Employment Category = $[1]$"), std::string::npos);

    Parsed chart(example("charts/simple-bar.xml"));
    ASSERT_NE(chart.vis->getElementById(u"interval_1"), nullptr);
    chart.vis->addPopup().SetAttribute(u"target", u"interval_1");
    ChartTransformer withPopups(chart.vis->AsUTF8());
    const std::string had = withPopups.getXML();
    EXPECT_EQ(withPopups.addPopups(), 0u);
    EXPECT_EQ(withPopups.getXML(), had);
}

// Every document the transformer writes passes both validators, data converted from a stream too.
TEST_F(TransformerTest, WrittenDocumentsValidate) {
    ChartTransformer t(example("charts/simple-bar.xml"));
    ASSERT_TRUE(t.applyTemplate(example("templates/bar-tidy.sgt")));
    EXPECT_EQ(t.addPopups(), 1u);
    for (const std::string& chart : {t.getXML(), t.getEntireXML(u"UTF-8"), inflate(t.getCompressedXML())})
        EXPECT_EQ(grammar_test::chartFaults(chart), "");
    const std::string stream = example("data/simple-bar.stream");
    ChartTransformer s(t.getCompressedXML(), reinterpret_cast<const unsigned char*>(stream.data()),
                       static_cast<unsigned>(stream.size()));
    for (const std::string& data : {inflate(t.getCompressedData()), inflate(s.getCompressedData())}) {
        ASSERT_TRUE(ChartBase::ValidXML(data));
        EXPECT_EQ(grammar_test::lintFaults("grxml-data-2.1.xsd", data), "");
    }
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
    char a[16], b[16];
    std::snprintf(a, sizeof a, "%02d", std::stoi(names[0].substr(std::strlen("Template_"), 2)));
    std::snprintf(b, sizeof b, "%02d", std::stoi(a) + 1);
    const std::string expected[] = {"Template_%.sgt", "Xml_after_template_%.xml",
                                    "Xml_before_template_%.xml"};
    for (std::size_t i = 0; i < names.size(); ++i) {
        std::string name = expected[i / 2];
        EXPECT_EQ(names[i], name.replace(name.find('%'), 1, i % 2 ? b : a));
    }
    // The before-dump is the whole document, with its data.
    EXPECT_FALSE(Parsed(readAll(dir.file(std::string("Xml_before_template_") + a + ".xml")))
                     .idsOf(u"embeddedSource")
                     .empty());
}

} // namespace

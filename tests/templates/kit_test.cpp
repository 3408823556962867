// The action kit as the actions see it: every family's rows reach the walk, every action finds
// graphs inside containers, and the sample outputs stay what they were before the kit.
#include "support/EngineSupport.h"

#include "templates/InstructionWalk.h"

#include <plotaid/ChartTemplate.h>

#include <grx/ChartPrinter.h>

#include <xercesc/dom/DOM.hpp>

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <functional>
#include <map>
#include <set>
#include <sstream>

using namespace engine_test;
using XERCES_CPP_NAMESPACE::DOMElement;

namespace {

std::string utf8(const XMLCh* s) {
    return ChartString(s).toUTF8();
}

TEST(ActionFamilies, EveryRegisteredRowIsOneOfTheWalksPairsAndReachesIt) {
    const plotaid::detail::InstructionTable table = plotaid::detail::instructionTable();
    ASSERT_EQ(table.count, 59u);
    std::map<std::string, const plotaid::detail::InstructionEntry*> byTag;
    for (std::size_t i = 0; i < table.count; ++i)
        byTag[utf8(table.entries[i].tag)] = &table.entries[i];
    std::set<std::string> registered;
    for (const auto& row : plotaid::detail::registeredActions()) {
        const std::string tag = utf8(row.tag);
        SCOPED_TRACE(tag);
        EXPECT_TRUE(registered.insert(tag).second) << "registered twice";
        ASSERT_EQ(byTag.count(tag), 1u);
        EXPECT_STREQ(byTag[tag]->actionClass, row.actionClass);
        EXPECT_EQ(byTag[tag]->make, row.make);
    }
    for (const char* built : {"setStyle", "setColor", "setDash", "setPattern", "setShape", "setSize", "addDash",
                              "addImage", "setGenericAttributes", "setShowLineMarkers"})
        EXPECT_EQ(registered.count(built), 1u) << built;
    // A tag no family carries out stays unsupported rather than dispatched to someone else's class.
    for (const auto& [tag, entry] : byTag) {
        if (!registered.count(tag)) {
            EXPECT_EQ(entry->make, nullptr) << tag;
        }
    }
}

// ---- graphs inside containers -------------------------------------------------------------------

class ContainerGraphs : public EngineTest {
public:
    Chart chart_ = Chart::parse(example("charts/container-lines.xml"));

    DOMElement* byId(const std::string& id) const {
        return chart_.document()->getElementById(ChartString(id).xc_str());
    }
    std::string attribute(const std::string& id, const char* name) const {
        const DOMElement* e = byId(id);
        return e ? utf8(e->getAttribute(ChartString(name).xc_str())) : "(missing " + id + ")";
    }
    std::size_t childCount(const std::string& id, const char* tag) const {
        std::size_t n = 0;
        for (const DOMElement* c = byId(id)->getFirstElementChild(); c; c = c->getNextElementSibling())
            n += utf8(c->getLocalName()) == tag;
        return n;
    }
    // The sample's lines carry no pattern: markers cloned from a patterned line would share its
    // cycle, which a second template application splits.
    void addPatterns() {
        for (int n : {1, 2}) {
            auto* line = GrxBaseElement::wrapperOf<CTElementType>(byId("line_" + std::to_string(n)));
            GrxPattern& pattern = line->addPattern();
            pattern.setId(ChartString("pattern_" + std::to_string(n)));
            pattern.SetAttribute(u"cycle", u"styleCycleShape");
        }
    }
    void apply(const std::string& instruction) {
        ChartTemplate t(*chart_.vis, nullptr);
        ASSERT_TRUE(t.setTemplate("<?xml version='1.0'?><template xmlns='http://plotaid.org/grxml' "
                                  "xmlns:xsi='http://www.w3.org/2001/XMLSchema-instance' "
                                  "xsi:schemaLocation='http://plotaid.org/grxml "
                                  "http://plotaid.org/grxml/grxml-template-3.5.xsd'>" +
                                  instruction + "</template>"));
        t.applyTemplate();
    }
};

const std::string kCycle = "<cycle><style color='#FF0000' stroke-dasharray='4 4' symbol='diamond' "
                           "size='9pt'/></cycle>";

struct Restyling {
    const char* name;
    std::string instruction;
    bool patterned;
    // Whether graph n's line (line_n) shows the instruction's effect.
    std::function<bool(const ContainerGraphs&, int)> restyled;
};

class ContainerRestyling : public ContainerGraphs, public ::testing::WithParamInterface<Restyling> {};

TEST_P(ContainerRestyling, ReachesBothGraphsInsideTheContainer) {
    ASSERT_TRUE(chart_.vis);
    if (GetParam().patterned)
        addPatterns();
    for (int n : {1, 2})
        ASSERT_FALSE(GetParam().restyled(*this, n)) << "graph " << n << " looks restyled before";
    apply(GetParam().instruction);
    for (int n : {1, 2})
        EXPECT_TRUE(GetParam().restyled(*this, n)) << "graph " << n;
}

std::string cycleOf(const ContainerGraphs& c, const char* kind, int n) {
    return c.attribute(std::string(kind) + "_" + std::to_string(n), "cycle");
}

INSTANTIATE_TEST_SUITE_P(
    TenInstructions, ContainerRestyling,
    ::testing::Values(
        Restyling{"setColor", "<setColor>" + kCycle + "</setColor>", false,
                  [](const ContainerGraphs& c, int n) { return cycleOf(c, "color", n) != "styleCycleColor"; }},
        Restyling{"setDash", "<setDash>" + kCycle + "</setDash>", false,
                  [](const ContainerGraphs& c, int n) { return cycleOf(c, "dash", n) != "styleCycleDash"; }},
        Restyling{"setShape", "<setShape>" + kCycle + "</setShape>", false,
                  [](const ContainerGraphs& c, int n) { return cycleOf(c, "shape", n) != "styleCycleShape"; }},
        Restyling{"setPattern", "<setPattern>" + kCycle + "</setPattern>", true,
                  [](const ContainerGraphs& c, int n) { return cycleOf(c, "pattern", n) != "styleCycleShape"; }},
        Restyling{"setSize", "<setSize>" + kCycle + "</setSize>", false,
                  [](const ContainerGraphs& c, int n) { return cycleOf(c, "size", n) != "styleCycleSize"; }},
        Restyling{"addDash", "<addDash>" + kCycle + "</addDash>", false,
                  [](const ContainerGraphs& c, int n) {
                      const std::string line = "line_" + std::to_string(n);
                      return c.childCount(line, "color") == 0 && c.childCount(line, "dash") == 2;
                  }},
        Restyling{"addImage", "<addImage>" + kCycle + "</addImage>", false,
                  [](const ContainerGraphs& c, int n) {
                      const std::string line = "line_" + std::to_string(n);
                      return c.childCount(line, "color") == 0 && c.childCount(line, "image") == 1;
                  }},
        Restyling{"setGenericAttributes", "<setGenericAttributes elementName='line' showDiscontinuity='true'/>", false,
                  [](const ContainerGraphs& c, int n) {
                      return c.attribute("line_" + std::to_string(n), "showDiscontinuity") == "true";
                  }},
        Restyling{"setShowLineMarkers", "<setShowLineMarkers/>", false,
                  [](const ContainerGraphs& c, int n) {
                      return c.childCount("frame_graph_" + std::to_string(n), "point") == 1;
                  }},
        Restyling{"setStyle", "<setStyle type='line'><style number='0' color2='#123456'/>"
                              "<style number='1' color2='#654321'/></setStyle>",
                  false,
                  [](const ContainerGraphs& c, int n) {
                      const std::string style = c.attribute("line_" + std::to_string(n), "style");
                      return c.attribute(style, "color2") == (n == 1 ? "#123456" : "#654321");
                  }}),
    [](const ::testing::TestParamInfo<Restyling>& info) { return std::string(info.param.name); });

// ---- outputs before and after the kit ----------------------------------------------------------

// FNV-1a: a digest the golden list can hold in a line per output.
std::uint64_t digest(const std::string& text) {
    std::uint64_t h = 14695981039346656037ull;
    for (unsigned char c : text)
        h = (h ^ c) * 1099511628211ull;
    return h;
}

std::string goldenPath() {
    return std::string(PLOTAID_TEST_DATA_DIR) + "/templates/sample-outputs.txt";
}

// Each example template applied alone to each sample chart, as printed. The charts with graphs in
// containers are left out: they are the ones whose output was meant to change.
TEST_F(EngineTest, SampleOutputsAreThoseOfTheLandedActions) {
    std::vector<std::string> charts, templates;
    for (const auto& e : std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/charts"))
        if (e.path().extension() == ".xml" && e.path().filename() != "container-lines.xml")
            charts.push_back(e.path().filename().string());
    for (const auto& e : std::filesystem::directory_iterator(std::string(PLOTAID_EXAMPLES_DIR) + "/templates"))
        if (e.path().extension() == ".sgt")
            templates.push_back(e.path().filename().string());
    std::sort(charts.begin(), charts.end());
    std::sort(templates.begin(), templates.end());

    std::ostringstream now;
    for (const std::string& chart : charts)
        for (const std::string& name : templates) {
            Chart c = Chart::parse(example("charts/" + chart));
            ASSERT_TRUE(c.vis) << chart;
            ChartTemplate t(*c.vis, nullptr);
            ASSERT_TRUE(t.setTemplate(example("templates/" + name))) << name;
            t.applyTemplate();
            std::ostringstream printed;
            ChartPrinter().Print(c.document(), printed);
            now << chart << ' ' << name << ' ' << std::hex << digest(printed.str()) << std::dec << '\n';
        }
    if (std::getenv("PLOTAID_WRITE_GOLDEN") != nullptr) {
        std::ofstream(goldenPath()) << now.str();
        GTEST_SKIP() << "wrote " << goldenPath();
    }
    EXPECT_EQ(readText(goldenPath()), now.str());
}

} // namespace

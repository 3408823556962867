// The action kit as the actions see it: every family's rows reach the walk, and every action finds
// graphs inside containers.
#include "templates/TemplateSupport.h"

#include <algorithm>
#include <functional>
#include <set>

using namespace template_test;

namespace {

// Fifty-nine distinct tags and classes, each tag declared by the grammar.
TEST(ActionFamilies, EveryRegisteredRowIsOneOfTheWalksPairsAndReachesIt) {
    const plotaid::detail::InstructionTable table = plotaid::detail::instructionTable();
    ASSERT_EQ(table.count, 59u);
    const std::string grammar =
        readAll(std::string(PLOTAID_SOURCE_DIR) + "/resources/schemas/grxml-template-3.5.xsd");
    std::map<std::string, const plotaid::detail::InstructionEntry*> byTag;
    std::set<std::string> classes;
    for (std::size_t i = 0; i < table.count; ++i) {
        const std::string tag = u8(table.entries[i].tag);
        EXPECT_TRUE(byTag.emplace(tag, &table.entries[i]).second) << tag;
        EXPECT_TRUE(classes.insert(table.entries[i].actionClass).second) << table.entries[i].actionClass;
        EXPECT_NE(grammar.find("<xs:element name=\"" + tag + "\""), std::string::npos) << tag;
    }
    std::set<std::string> registered;
    for (const auto& row : plotaid::detail::registeredActions()) {
        const std::string tag = u8(row.tag);
        SCOPED_TRACE(tag);
        EXPECT_TRUE(registered.insert(tag).second) << "registered twice";
        ASSERT_EQ(byTag.count(tag), 1u);
        EXPECT_STREQ(byTag[tag]->actionClass, row.actionClass);
        EXPECT_EQ(byTag[tag]->make, row.make);
    }
    // A tag no family carries out stays unsupported rather than dispatched to someone else's class.
    for (const auto& [tag, entry] : byTag)
        EXPECT_TRUE(registered.count(tag) || entry->make == nullptr) << tag;
}

// The container sample: two graphs in a container, line_1 and line_2 with their aesthetics.
struct Restyling {
    const char* tag;
    // Whether graph n ("1" or "2") shows the instruction's effect.
    std::function<bool(const GrxVisualization&, const std::string&)> restyled;
    std::string instruction = "";
    bool patterned = false;
};

// The aesthetic `kind`_n no longer on the sample's cycle `was`.
Restyling recycled(const char* tag, const char* kind, const char* was, bool patterned = false) {
    return {tag,
            [=](const GrxVisualization& c, const std::string& n) {
                return attr(byId(c, kind + ("_" + n)), "cycle") != was;
            },
            "", patterned};
}
std::size_t childCount(const GrxVisualization& c, const std::string& id, const char* tag) {
    const std::string children = at(c, id + "/" + tag + "*");
    return std::count(children.begin(), children.end(), '{');
}
// The line's colours all became `kind` children, `count` of them.
Restyling converted(const char* tag, const char* kind, std::size_t count) {
    return {tag, [=](const GrxVisualization& c, const std::string& n) {
                return childCount(c, "line_" + n, "color") == 0 && childCount(c, "line_" + n, kind) == count;
            }};
}

class ContainerRestyling : public TemplateTest, public ::testing::WithParamInterface<Restyling> {};

TEST_P(ContainerRestyling, ReachesBothGraphsInsideTheContainer) {
    GrxVisualization& chart = sample("container-lines.xml");
    // The sample's lines carry no pattern: markers cloned from a patterned line would share its
    // cycle, which a second template application splits.
    for (const std::string n : {"1", "2"})
        if (GetParam().patterned) {
            GrxPattern& pattern = byId<CTElementType>(chart, "line_" + n)->addPattern();
            pattern.setId(ChartString("pattern_" + n));
            pattern.SetAttribute(u"cycle", u"styleCycleShape");
        }
    for (const std::string n : {"1", "2"})
        ASSERT_FALSE(GetParam().restyled(chart, n)) << "graph " << n << " looks restyled before";
    const std::string tag = GetParam().tag;
    ChartTemplate t(chart, nullptr);
    ASSERT_TRUE(t.setTemplate(
        templateOf(GetParam().instruction.empty()
                       ? "<" + tag +
                             "><cycle><style color='#FF0000' stroke-dasharray='4 4' symbol='diamond' "
                             "size='9pt'/></cycle></" +
                             tag + ">"
                       : GetParam().instruction)));
    t.applyTemplate();
    for (const std::string n : {"1", "2"})
        EXPECT_TRUE(GetParam().restyled(chart, n)) << "graph " << n;
}

INSTANTIATE_TEST_SUITE_P(
    TenInstructions, ContainerRestyling,
    ::testing::Values(recycled("setColor", "color", "styleCycleColor"),
                      recycled("setDash", "dash", "styleCycleDash"),
                      recycled("setShape", "shape", "styleCycleShape"),
                      recycled("setPattern", "pattern", "styleCycleShape", true),
                      recycled("setSize", "size", "styleCycleSize"), converted("addDash", "dash", 2),
                      converted("addImage", "image", 1),
                      Restyling{"setGenericAttributes",
                                [](const GrxVisualization& c, const std::string& n) {
                                    return attr(byId(c, "line_" + n), "showDiscontinuity") == "true";
                                },
                                "<setGenericAttributes elementName='line' showDiscontinuity='true'/>"},
                      Restyling{"setShowLineMarkers",
                                [](const GrxVisualization& c, const std::string& n) {
                                    return childCount(c, "frame_graph_" + n, "point") == 1;
                                },
                                "<setShowLineMarkers/>"},
                      Restyling{"setStyle",
                                [](const GrxVisualization& c, const std::string& n) {
                                    return attr(byId(c, attr(byId(c, "line_" + n), "style")), "color2") ==
                                           (n == "1" ? "#123456" : "#654321");
                                },
                                "<setStyle type='line'><style number='0' color2='#123456'/>"
                                "<style number='1' color2='#654321'/></setStyle>"}),
    [](const ::testing::TestParamInfo<Restyling>& info) { return std::string(info.param.tag); });

} // namespace

// A designer template applied twice: what replaces gives the same styles as one application;
// what appends shows where it appends.
#include "DesignerSupport.h"

using namespace designer_test;
using engine_test::Chart;
using engine_test::EngineTest;

namespace {

// Lines "key: once -> twice" for every key whose value differs or exists on one side only.
std::string differences(const std::map<std::string, std::string>& once,
                        const std::map<std::string, std::string>& twice) {
    std::string out;
    for (const auto& [key, value] : once) {
        const auto other = twice.find(key);
        if (other == twice.end())
            out += key + ": " + value + "-> (gone)\n";
        else if (other->second != value)
            out += key + ": " + value + "-> " + other->second + "\n";
    }
    for (const auto& [key, value] : twice)
        if (once.count(key) == 0)
            out += key + ": (new) -> " + value + "\n";
    return out;
}

class AppliedTwice : public EngineTest, public ::testing::WithParamInterface<std::string> {};

TEST_P(AppliedTwice, ChangesNoStyleOfAnySampleChart) {
    const std::string name = GetParam();
    for (const std::string& chart : exampleFiles("charts", ".xml")) {
        SCOPED_TRACE(name + " on " + chart);
        const Chart original = Chart::parse(engine_test::example("charts/" + chart));
        const Chart once = applied(chart, {name});
        const Chart twice = applied(chart, {name, name});
        ASSERT_TRUE(original.vis && once.vis && twice.vis);
        const auto before = stylePicture(original);
        const auto first = stylePicture(once);
        // The template must change something, or the comparison below proves nothing.
        EXPECT_NE(differences(before, first), "");
        EXPECT_EQ(differences(first, stylePicture(twice)), "");
    }
}

INSTANTIATE_TEST_SUITE_P(Templates, AppliedTwice, ::testing::ValuesIn(designerTemplates()),
                         [](const ::testing::TestParamInfo<std::string>& info) {
                             return info.param.substr(0, info.param.find('.'));
                         });

// The picture the comparison rests on must see a changed value, a new style and a cycle that
// changed its styles, and must not see ids or a cycle nothing refers to.
using StylePicture = EngineTest;

TEST_F(StylePicture, SeesValuesNotIds) {
    const Chart c = Chart::parse(engine_test::example("charts/line-series.xml"));
    ASSERT_TRUE(c.vis);
    const auto before = stylePicture(c);
    EXPECT_EQ(before.count("style lineStyle"), 1u);

    // A changed value.
    byId(c, "lineStyle")->setAttribute(u"stroke-width", u"9pt");
    const auto changed = stylePicture(c);
    EXPECT_NE(differences(before, changed).find("style lineStyle"), std::string::npos);

    // A style cycle's style changed: keyed by what refers to the cycle.
    byId(c, "styleCycleDash_2")->setAttribute(u"stroke-dasharray", u"1 1");
    EXPECT_NE(differences(changed, stylePicture(c)).find("dash#dash_1.cycle"), std::string::npos);

    // The same cycle under a new id, referred to in place of the old one: nothing to see.
    const auto replaced = stylePicture(c);
    DOMElement* cycle = byId(c, "styleCycleDash");
    auto* copy = static_cast<DOMElement*>(cycle->cloneNode(true));
    copy->setAttribute(u"id", u"styleCycle7");
    for (DOMElement* s : elementsNamed(copy, "style"))
        s->setAttribute(u"id", (ChartString(attr(s, "id")) + ChartString("_copy")).xc_str());
    cycle->getParentNode()->appendChild(copy);
    for (DOMElement* e : elementsNamed(c.document(), "*"))
        if (attr(e, "cycle") == "styleCycleDash")
            e->setAttribute(u"cycle", u"styleCycle7");
    EXPECT_EQ(differences(replaced, stylePicture(c)), "");
}

} // namespace

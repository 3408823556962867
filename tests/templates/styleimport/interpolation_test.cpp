#include "StyleImportSupport.h"

#include <grx/GrxUni.h>

using namespace XERCES_CPP_NAMESPACE;
using engine_test::Chart;
using engine_test::EngineTest;
using styleimport_test::Probe;
using styleimport_test::utf8;

namespace {

// A graph with two lines (one of style "lineStyle", one of "otherLine"), an area of "areaStyle"
// and a path without a style; every element has an id.
Chart linesAreasAndPaths() {
    Chart chart = Chart::empty();
    GrxVisualization& vis = *chart.vis;
    vis.addStyle().setId(u"c-o-n-t-a-i-n-er");
    GrrUviza& graph = vis.addGraph();
    auto styled = [&](CTElementType& e, const char16_t* id, const char16_t* style) {
        e.setId(id);
        GrxStyle& s = vis.addStyle();
        s.setId(style);
        e.setStyle(s);
    };
    styled(graph.addLine(), u"line_a", u"lineStyle");
    styled(graph.addLine(), u"line_b", u"otherLine");
    styled(graph.addArea(), u"area_a", u"areaStyle");
    graph.addPath().setId(u"path_a");
    return chart;
}

class Interpolation : public EngineTest {
protected:
    void SetUp() override { chart_ = linesAreasAndPaths(); }

    void import(const char16_t* styleId, const std::string& interpolation, const Chart* source = nullptr) {
        const DOMElement* e = elements_.make("<style>" + interpolation + "</style>");
        ASSERT_NE(e, nullptr);
        GrxStyle* style = chart_.vis->getStyleById(styleId);
        ASSERT_NE(style, nullptr);
        Probe(source ? source->vis.get() : nullptr, *chart_.vis, nullptr).importStyle(e, *style);
    }
    CTElementType& element(const char16_t* id) {
        return *GrxBaseElement::wrapperOf<CTElementType>(chart_.vis->getElementById(id));
    }
    // The smoothing method of the element's first smooth statistic; -1 when it has none.
    int method(const char16_t* id) {
        const std::vector<GrxSmoothStatistic*> smooths = element(id).getSmoothStatistics();
        return smooths.empty() ? -1 : smooths.front()->getMethod();
    }

    Chart chart_;
    styleimport_test::StyleElements elements_;
};

TEST_F(Interpolation, MatchingLinesAndEveryAreaAndPathShareOneStatisticOfTheChosenMethod) {
    import(u"lineStyle", R"(<interpolation type="step" pointPosition="right"/>)");
    EXPECT_EQ(method(u"line_a"), 14);
    EXPECT_EQ(method(u"line_b"), -1);
    EXPECT_EQ(method(u"area_a"), 14);
    EXPECT_EQ(method(u"path_a"), 14);
    EXPECT_FALSE(element(u"line_b").isShowDiscontinuityPresent());
    // The container style matches every line.
    import(u"c-o-n-t-a-i-n-er", R"(<interpolation type="step" pointPosition="left"/>)");
    EXPECT_EQ(method(u"line_b"), 13);
    const struct {
        const char* interpolation;
        int method;
        bool discontinuity;
    } rows[] = {{R"(<interpolation type="jump" pointPosition="left"/>)", 13, true},
                {R"(<interpolation type="step"/>)", 15, false},
                {R"(<interpolation type="jump" pointPosition="right"/>)", 14, true},
                {R"(<interpolation type="straight" pointPosition="left"/>)", 0, false}};
    for (const auto& row : rows) {
        import(u"lineStyle", row.interpolation);
        EXPECT_EQ(method(u"line_a"), row.method) << row.interpolation;
        EXPECT_EQ(element(u"line_a").getShowDiscontinuity(), row.discontinuity) << row.interpolation;
    }
    EXPECT_EQ(element(u"area_a").getSmoothStatistics().size(), 1u);
    // Written so that it reads back.
    const Chart reread = Chart::parse(chart_.vis->AsUTF8());
    ASSERT_TRUE(reread.vis);
    const auto* line = GrxBaseElement::wrapperOf<CTElementType>(reread.vis->getElementById(u"line_a"));
    ASSERT_NE(line, nullptr);
    ASSERT_EQ(line->getSmoothStatistics().size(), 1u);
    EXPECT_EQ(line->getSmoothStatistics().front()->getMethod(), 0);
}

TEST_F(Interpolation, WithoutATypeNothingIsSmoothedButElementsGetStyles) {
    import(u"lineStyle", R"(<interpolation pointPosition="left"/>)");
    for (const char16_t* id : {u"line_a", u"area_a", u"path_a"})
        EXPECT_EQ(method(id), -1) << utf8(id);
    // The path had no style; it has one of the template's now, inside the container.
    GrxStyle* added = element(u"path_a").getStyle();
    ASSERT_NE(added, nullptr);
    EXPECT_EQ(utf8(added->getId()), "style1");
    EXPECT_EQ(added->getImplementation()->getParentNode(),
              chart_.vis->getStyleById(u"c-o-n-t-a-i-n-er")->getImplementation());
    import(u"lineStyle", R"(<interpolation/>)");
    EXPECT_EQ(element(u"path_a").getStyle(), added);
}

TEST_F(Interpolation, MissingValuesOnlyWhereTheSourceHoldsTheElementWithNoBreakRepresentation) {
    // No source, a source without the element, or one with a representation of its own: nothing.
    const Chart elsewhere = Chart::empty();
    Chart own = linesAreasAndPaths();
    GrxBaseElement::wrapperOf<CTElementType>(own.vis->getElementById(u"line_a"))->setBreakRepresentation(2);
    for (const Chart* source :
         {static_cast<const Chart*>(nullptr), &elsewhere, static_cast<const Chart*>(&own)}) {
        import(u"lineStyle", R"(<interpolation missingRepresentation="gap"/>)", source);
        EXPECT_FALSE(element(u"line_a").isBreakRepresentationPresent());
    }
    const Chart source = linesAreasAndPaths();
    import(u"lineStyle", R"(<interpolation missingRepresentation="wings"/>)", &source);
    EXPECT_EQ(utf8(element(u"line_a").GetAttribute(u"breakRepresentation")), "wings");
    EXPECT_FALSE(element(u"line_b").isBreakRepresentationPresent()); // not matching
    EXPECT_FALSE(element(u"area_a").isBreakRepresentationPresent());
    import(u"c-o-n-t-a-i-n-er", R"(<interpolation missingRepresentation="interpolated"/>)", &source);
    for (const char16_t* id : {u"line_a", u"line_b", u"area_a"})
        EXPECT_EQ(element(id).getBreakRepresentation(), 2) << utf8(id);
    import(u"lineStyle", R"(<interpolation missingRepresentation="gap"/>)", &source);
    import(u"lineStyle", R"(<interpolation missingRepresentation="dots"/>)", &source);
    EXPECT_EQ(element(u"line_a").getBreakRepresentation(), 1);
}

} // namespace

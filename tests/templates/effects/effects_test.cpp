// Visual effects on the sample charts: what each adds, where it refuses, and that the charts stay sound.
#include "templates/TemplateSupport.h"
#include "templates/actions/effects.h"

using namespace template_test;
using namespace plotaid::detail;

namespace {

class Effects : public TemplateTest {
protected:
    static std::string guides(const GrrUviza& graph) {
        std::string out;
        for (const GrxFrameGuide* g : graph.getFrameGuides())
            out += "frame:" + attr(g->getStyle(), "color") + ";";
        for (const GrxPlaneGuide* g : graph.getPlaneGuides())
            out += std::to_string(g->getNormal()) + ":" + attr(g->getStyle(), "color") + ";";
        return out;
    }
};

TEST_F(Effects, ExplodedSlicesKeepTheirMappedCategories) {
    GrxVisualization& chart = sample("pie.xml");
    CTVariableType& jobs = *byId<CTVariableType>(chart, "var_jobcat");
    byId<CTElementType>(chart, "interval_1")->addX().setVariable(jobs);
    GrxFormat& format = jobs.addFormat();
    format.addRelabel().setFrom(ChartString("2"));
    format.getRelabels()[0]->setTo(ChartString("Custodial"));
    EXPECT_FALSE(act<TSetExplodeSlice>("<setExplodeSlice/>", chart));
    act<TSetExplodeSlice>(
        "<setExplodeSlice><categoryValue>Custodial;Manager</categoryValue></setExplodeSlice>", chart);
    EXPECT_EQ(at(chart, "interval_1/offset*"),
              "{domain=categoricalDomain1;high=3%;low=3%;variable=var_jobcat;}");
    const GrxOffset& offset = *byId<CTElementType>(chart, "interval_1")->getOffsets()[0];
    const auto* domain = dynamic_cast<const GrxCategoricalDomain*>(offset.getDomain());
    ASSERT_NE(domain, nullptr);
    ASSERT_EQ(domain->getCategoriess().size(), 1u);
    EXPECT_EQ(u8(domain->getCategoriess()[0]->getTextContent().xc_str()), "2");
    EXPECT_EQ(at(chart, "coordinates_1/insetTransform*"), "{xMax=0.2;xMin=0.2;yMax=0.2;yMin=0.2;}");
    EXPECT_EQ(grammar_test::chartFaults(chart), "");
    // A legend variable that is not categorical explodes nothing.
    GrxVisualization& plain = sample("pie.xml");
    byId<CTElementType>(plain, "interval_1")->addX().setVariable(*byId<CTVariableType>(plain, "var_jobcat"));
    byId<CTVariableType>(plain, "var_jobcat")->setCategorical(0);
    const std::string before = canonical(plain);
    act<TSetExplodeSlice>("<setExplodeSlice><categoryValue>Clerical</categoryValue></setExplodeSlice>",
                          plain);
    EXPECT_EQ(canonical(plain), before);
}

TEST_F(Effects, PlanesRotationShadowAndWireFrame) {
    expectWalks({
        {"simple-bar.xml", "<setBackPlane><plane role='x'><style color='red'/></plane></setBackPlane>",
         "applied ", "unchanged"},
        {"bar-3d.xml", "<setBackPlane/>", "failed ", "unchanged"},
        {"bar-3d.xml",
         "<setRotation method='oblique' theta='40'><parameter name='theta' value='9'/></setRotation>",
         "applied ", "coordinates_1/obliqueTransform*={theta=40;}"},
        {"bar-3d.xml", "<setRotation><parameter name='phi' value='9'/></setRotation>", "applied ",
         "coordinates_1/rectangularTransform*={phi=9;}"},
        {"simple-bar.xml", "<addShadow shadow_dx='2pt'/>", "failed ", "unchanged"},
        {"scatter.xml", "<addShadow shadow-dx='2pt' shadow-dy='1pt'/>", "applied ", "unchanged"},
        {"simple-bar.xml", "<addShadow shadow_dx='2pt' shadow_dy='1pt'/>", "applied ",
         "coordinates_1/insetTransform*={xMax=0.05;xMin=0;yMax=0.05;yMin=0;}"},
        {"simple-bar.xml", "<setWireFrame><style color='red'/></setWireFrame>", "applied ", "unchanged"},
        {"bar-3d.xml", "<setWireFrame complete='true'><style color='red'/></setWireFrame>", "applied ",
         "frame_graph_1/frameGuide*={complete=true;coordinates=coordinates_1;style=wireStyle;}"},
        {"bar-3d.xml", "<setWireFrame/>", "failed ", "unchanged"},
    });
    GrxVisualization& chart = sample("bar-3d.xml");
    act<TSetBackPlane>("<setBackPlane><plane role=\"y\"><style color=\"red\"/></plane></setBackPlane>",
                       chart);
    EXPECT_EQ(guides(*byId<GrrUviza>(chart, "frame_graph_1")),
              "frame:-;0:red;1:red;2:red;"); // the planes share one style
    EXPECT_EQ(attr(byId<GrxStyle>(chart, "barStyle"), "shadow-color"), "-");
    act<TShadowEffects>("<addShadow shadow_dx=\"2pt\" shadow_dy=\"1pt\"/>", chart);
    EXPECT_EQ(attr(byId<GrxStyle>(chart, "barStyle"), "shadow-color") +
                  attr(byId<GrxStyle>(chart, "barStyle"), "shadow-opacity"),
              "grey0.5");
    EXPECT_TRUE(byId<GrxCoordinates>(chart, "coordinates_1")->getRectangularTransforms().empty());
}

TEST_F(Effects, BarAndPieDepth) {
    GrxVisualization& chart = sample("simple-bar.xml");
    const std::string bars = "<addBarEffects theta=\"30\"><style number=\"1\" color=\"green\"/><style "
                             "number=\"2\" color=\"red\"/><style color=\"blue\"/></addBarEffects>";
    EXPECT_TRUE(act<TAddBarEffects>(bars, chart));
    EXPECT_TRUE(act<TAddBarEffects>(bars, chart));
    const GrrUviza& graph = *byId<GrrUviza>(chart, "frame_graph_1");
    EXPECT_EQ(guides(graph), "frame:blue;0:green;1:red;2:silver;");
    EXPECT_EQ(attr(byId<GrxStyle>(chart, "barStyle"), "depth"), "100%");
    EXPECT_EQ(byId<GrxCoordinates>(chart, "coordinates_1")->getDimensions().size(), 3u);
    EXPECT_EQ(at(chart, "coordinates_1/obliqueTransform*"), "{theta=30;}");
    EXPECT_EQ(grammar_test::chartFaults(chart), "");
    for (const char* refused : {"bar-3d.xml", "pie.xml", "scatter.xml"}) { // a z variable, polar, no bars
        GrxVisualization& other = sample(refused);
        const std::string before = canonical(other);
        EXPECT_FALSE(act<TAddBarEffects>("<addBarEffects/>", other)) << refused;
        EXPECT_EQ(canonical(other), before) << refused;
    }
    EXPECT_TRUE(
        act<TAddBarEffects>("<addBarEffects applyToNonBar=\"true\" depth=\"50%\"/>", sample("scatter.xml")));

    GrxVisualization& pie = sample("pie.xml");
    GrxStyle& slice = *byId<GrxStyle>(pie, "sliceStyle");
    slice.setShadow_dx(ChartString("2pt"));
    slice.setShadow_color(ChartString("grey"));
    GrxCoordinates& coordinates = *byId<GrxCoordinates>(pie, "coordinates_1");
    coordinates.removeTransposeTransforms();
    coordinates.addDimension();
    EXPECT_TRUE(
        act<TAddPieEffects>("<addPieEffects><parameter name=\"phi\" value=\"20\"/></addPieEffects>", pie));
    EXPECT_EQ(attributesOf(slice.getImplementation()), "color=#3E58AC;color2=white;stroke-width=1pt;");
    EXPECT_EQ(coordinates.getDimensions().size(), 1u);
    EXPECT_EQ(at(pie, "coordinates_1/rectangularTransform*"), "{phi=20;}");
    EXPECT_FALSE(act<TAddPieEffects>("<addPieEffects/>", sample("simple-bar.xml")));
}

} // namespace

// Annotation actions on the sample charts: which guides each adds or restyles, how they are
// decorated, where they are refused, and that every chart they leave is sound.
#include "templates/TemplateSupport.h"
#include "templates/actions/annotations.h"

using namespace template_test;
using namespace plotaid::detail;

namespace {

std::string styleText(const GrxStyle* s) {
    return s ? "{" + attributesOf(s->getImplementation()) + "}" : "{}";
}

// Each guide of each graph: "name(attributes)" without id and style, its style, its labels
// ('text' style frame) and its conditions.
std::string guides(const GrxVisualization& chart) {
    std::string out;
    for (GrrUviza* graph : allGraphs(chart))
        for (const DOMElement* e = graph->getImplementation()->getFirstElementChild(); e;
             e = e->getNextElementSibling()) {
            const auto* guide = GrxBaseElement::wrapperOf<CTGuideType>(e);
            if (guide == nullptr || u8(e->getTagName()) == "planeGuide" || u8(e->getTagName()) == "frameGuide")
                continue;
            std::string attrs;
            for (const auto& [name, value] : attributeMap(e))
                attrs += name == "id" || name == "style" ? "" : name + "=" + value + ";";
            out += u8(e->getTagName()) + "(" + attrs + ")" + styleText(guide->getStyle());
            for (const GrxLabel* l : guide->getLabels())
                out += " '" + l->getAllText().toUTF8() + "'" + styleText(l->getStyle()) + styleText(l->getTextFrameStyle());
            for (const GrxConditionalStyle* c : guide->getConditionalStyles())
                out += " " + u8(c->getWhen()) + styleText(c->getStyle());
            out += "\n";
        }
    return out;
}

enum class Prep { None, Relabel, NoY, NoTable, GuideAt3 };

class Annotations : public TemplateTest {
protected:
    GrxVisualization& prepared(const std::string& name, Prep setup) {
        GrxVisualization& chart = sample(name);
        if (setup == Prep::Relabel) {
            GrxRelabel& relabel = byId<CTVariableType>(chart, "var_jobcat")->addFormat().addRelabel();
            relabel.setFrom(u"Clerical");
            relabel.setTo(u"Office");
        }
        if (setup == Prep::NoY)
            byId<GrxCoordinates>(chart, "coordinates_1")->removeDimension(*byId<GrxDimension>(chart, "dim_y"));
        if (setup == Prep::NoTable)
            byId<GrxFacetLayout>(chart, "facetLayout_1")->removeTableLayouts();
        if (setup == Prep::GuideAt3) {
            GrxPointGuide& guide = allGraphs(chart).front()->addPointGuide();
            guide.setX(u"3.0");
            guide.addLabel();
        }
        return chart;
    }
    template <class T> bool run(GrxVisualization& chart, const std::string& instruction) {
        return act<T>(instruction, chart);
    }
};

const std::string kFrame = "{color=white;color2=black;}";

TEST_F(Annotations, GuidesAddedDecoratedOrRefused) {
    using Run = bool (Annotations::*)(GrxVisualization&, const std::string&);
    const Run line = &Annotations::run<TReferenceLine>, note = &Annotations::run<TAnchoredAnnotation>,
              box = &Annotations::run<TReferenceRectangle>, origin = &Annotations::run<TAddOriginLine>;
    const std::string black = "{color=black;";
    const struct {
        const char* chart;
        Prep setup;
        Run action;
        std::string instruction;
        bool applied;
        std::string added; // the guides after, the sample's own left out
    } rows[] = {
        // A value line with y: the label beside the line; with x only: above it. White text frame.
        {"line-series.xml", Prep::None, line, "<addReferenceLine y='50' name='Goal'><style color2='red'/><label>Aim</label></addReferenceLine>", true,
         "lineGuide(name=Goal;y=50;){color2=red;} 'Aim'{labelLocationHorizontal=2;labelLocationVertical=1;}" + kFrame + "\n"},
        {"line-series.xml", Prep::None, line, "<addReferenceLine x='Mar'><label>Start</label></addReferenceLine>", true,
         "lineGuide(x=Mar;){} 'Start'{labelLocationHorizontal=1;labelLocationVertical=2;}" + kFrame + "\n"},
        // x and y: one guide each, each decorated.
        {"line-series.xml", Prep::None, line, "<addReferenceLine x='Mar' y='9'><style color2='red'/></addReferenceLine>", true,
         "lineGuide(x=Mar;){color2=red;}\nlineGuide(y=9;){color2=red;}\n"},
        // A parameter fills an empty role only.
        {"line-series.xml", Prep::None, line, "<addReferenceLine y='7'><parameter name='y' value='8'/></addReferenceLine>", true, "lineGuide(y=7;){}\n"},
        // Without a y dimension nothing is left to add: nothing, and the walk goes on.
        {"simple-bar.xml", Prep::NoY, line, "<addReferenceLine y='5'/>", true, ""},
        {"simple-bar.xml", Prep::None, line, "<addReferenceLine name='n'/>", false, ""},
        // Category labels become category values; one the graph does not know skips it.
        {"simple-bar.xml", Prep::Relabel, line, "<addReferenceLine xcategorical='true' x='Office'/>", true, "lineGuide(x=Clerical;){}\n"},
        {"simple-bar.xml", Prep::Relabel, line, "<addReferenceLine xcategorical='true' x='Nobody' y='3'/>", true, ""},
        // A function line: fewer than 2 points means 100 segments; the expression is y.
        {"line-series.xml", Prep::None, line, "<addReferenceLine numberPoints='-4' y='3*x'/>", true, ""},
        {"scatter.xml", Prep::None, line, "<addReferenceLine numberPoints='1' y='3*x'/>", true,
         "functionGuide(segments=100;value=3*x;){}\n"},
        {"scatter.xml", Prep::None, line, "<addReferenceLine numberPoints='7' y='x' coordinate='1'/>", true, ""},
        // Polar graphs and tables of facets get none; a scatterplot matrix hides the line on the diagonal.
        {"pie.xml", Prep::None, line, "<addReferenceLine y='1'/>", true, ""},
        {"scatterplot-matrix.xml", Prep::None, line, "<addReferenceLine y='1'/>", true, ""},
        {"scatterplot-matrix.xml", Prep::NoTable, line, "<addReferenceLine y='1'/>", true, "lineGuide(y=1;){} facet1==facet2{visible=false;}\n"},
        // Annotations: a category value from a parameter whose own flag counts where the
        // instruction says nothing; the instruction's flag wins over it.
        {"simple-bar.xml", Prep::Relabel, note, "<addAnchoredAnnotation xcategorical='true' y='4'><label>n</label><parameter name='x' value='Office'/></addAnchoredAnnotation>", true,
         "pointGuide(x=Clerical;y=4;){color=transparent;color2=transparent;symbol=none;} 'n'" + black + "}{color=white;}\n"},
        {"simple-bar.xml", Prep::Relabel, note, "<addAnchoredAnnotation><label/><parameter name='x' value='Office' categorical='true'/></addAnchoredAnnotation>", true,
         "pointGuide(x=Clerical;){color=transparent;color2=transparent;symbol=none;} ''" + black + "}{color=white;}\n"},
        {"simple-bar.xml", Prep::Relabel, note, "<addAnchoredAnnotation xcategorical='false'><label/><parameter name='x' value='Office' categorical='true'/></addAnchoredAnnotation>", true,
         "pointGuide(x=Office;){color=transparent;color2=transparent;symbol=none;} ''" + black + "}{color=white;}\n"},
        {"simple-bar.xml", Prep::NoY, note, "<addAnchoredAnnotation x='1' y='2' name='m'><label/></addAnchoredAnnotation>", true,
         "pointGuide(name=m;x=1;){color=transparent;color2=transparent;symbol=none;} ''" + black + "}{color=white;}\n"},
        {"simple-bar.xml", Prep::None, note, "<addAnchoredAnnotation y='2'><label/></addAnchoredAnnotation>", false, ""},
        {"simple-bar.xml", Prep::None, note, "<addAnchoredAnnotation x='2'/>", false, ""},
        // Style only: 3 matches 3.0, 4 does not.
        {"line-series.xml", Prep::GuideAt3, note, "<addAnchoredAnnotation x='3' styleOnly='true'><label><style color='red'/></label></addAnchoredAnnotation>", true,
         "pointGuide(x=3.0;){} ''{color=red;}{color=transparent;color2=transparent;visible=false;}\n"},
        {"line-series.xml", Prep::GuideAt3, note, "<addAnchoredAnnotation x='4' styleOnly='true'><label><style color='red'/></label></addAnchoredAnnotation>", true,
         "pointGuide(x=3.0;){} ''{}{}\n"},
        // Rectangles: a used id gets a fresh one, one pair only, the label beside it.
        {"scatter.xml", Prep::None, box, "<addReferenceRectangle id='graphStyle' x1='1' x2='2' y1='3' y2='4' zOrder='-2'><label>R</label></addReferenceRectangle>", true,
         "rectangleGuide(x1=1;x2=2;zOrder=-2;){} 'R'{labelLocationHorizontal=2;labelLocationVertical=1;}" + kFrame + "\n"},
        {"scatter.xml", Prep::None, box, "<addReferenceRectangle id='mine' y1='3' y2='4' name='band'/>", true, "rectangleGuide(name=band;y1=3;y2=4;){}\n"},
        {"scatter.xml", Prep::None, box, "<addReferenceRectangle name='band'/>", false, ""},
        {"pie.xml", Prep::None, box, "<addReferenceRectangle y1='3'/>", true, ""},
        // The origin line: named in the extension, hidden off the diagonal; a categorical role is refused.
        {"scatterplot-matrix.xml", Prep::None, origin, "<addOriginLine><parameter name='x' value='0'/><style color2='gray'/></addOriginLine>", true,
         "lineGuide(x=0;){color2=gray;} facet1!=facet2{visible=false;}\n"},
        {"simple-bar.xml", Prep::None, origin, "<addOriginLine x='0'/>", false, ""},
        {"simple-bar.xml", Prep::None, origin, "<addOriginLine><parameter name='w' value='0'/></addOriginLine>", false, ""},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.instruction);
        const std::string before = guides(sample(row.chart));
        GrxVisualization& chart = prepared(row.chart, row.setup);
        EXPECT_EQ((this->*row.action)(chart, row.instruction), row.applied);
        const std::string after = guides(chart);
        EXPECT_EQ(after.substr(0, before.size()), before);
        EXPECT_EQ(after.substr(before.size()), row.added);
        EXPECT_EQ(grammar_test::chartFaults(chart), "");
    }
}

TEST_F(Annotations, StyleOnlyRestylesMatchingGuidesAndAddingTwiceAddsTwice) {
    GrxVisualization& chart = sample("scatter.xml");
    // The existing function line takes the style and the label and frame declarations.
    EXPECT_TRUE(act<TReferenceLine>("<addReferenceLine numberPoints='2' styleOnly='true'><style color2='blue'/>"
                                    "<label><style font-size='7pt'/><style number='1' color='yellow'/></label></addReferenceLine>",
                                    chart));
    EXPECT_EQ(attr(byId(chart, "refLineStyle"), "color2"), "blue");
    EXPECT_EQ(attr(byId(chart, "legendTextStyle"), "font-size"), "7pt");
    EXPECT_EQ(attr(byId<GrxLabel>(chart, "functionGuide_1_label")->getTextFrameStyle(), "color"), "yellow");
    // Value lines restyled by value: an empty given value matches any.
    act<TReferenceLine>("<addReferenceLine y='5'/>", chart);
    act<TReferenceLine>("<addReferenceLine y='6'/>", chart);
    act<TReferenceLine>("<addReferenceLine y='6' styleOnly='true'><style color2='green'/></addReferenceLine>", chart);
    const std::vector<GrxLineGuide*> lines = allGraphs(chart).front()->getLineGuides();
    ASSERT_EQ(lines.size(), 2u);
    EXPECT_EQ(attr(lines[0]->getStyle(), "color2") + attr(lines[1]->getStyle(), "color2"), "-green");
    // Rectangles restyled by id or by range.
    act<TReferenceRectangle>("<addReferenceRectangle id='r' x1='1' x2='2'/>", chart);
    act<TReferenceRectangle>("<addReferenceRectangle y1='1' y2='2'/>", chart);
    act<TReferenceRectangle>("<addReferenceRectangle id='r' styleOnly='true' zOrder='3'><style color='pink'/></addReferenceRectangle>", chart);
    act<TReferenceRectangle>("<addReferenceRectangle y1='1' styleOnly='true'><style color='gold'/></addReferenceRectangle>", chart);
    const std::vector<GrxRectangleGuide*> boxes = allGraphs(chart).front()->getRectangleGuides();
    ASSERT_EQ(boxes.size(), 2u);
    // Any given end may select: without y2, a rectangle without y2 (the x range too) is taken.
    EXPECT_EQ(attr(boxes[0]->getStyle(), "color") + attr(boxes[0], "zOrder") + attr(boxes[1]->getStyle(), "color") +
                  attr(boxes[1], "zOrder"),
              "gold3gold-");
    // Origin lines and reference lines add again; the extension names the newest origin line.
    act<TAddOriginLine>("<addOriginLine y='0'/>", chart);
    act<TAddOriginLine>("<addOriginLine y='0'/>", chart);
    EXPECT_EQ(attr(chart.getExtension(), "originLineY"), "lineGuide2");
    EXPECT_EQ(allGraphs(chart).front()->getLineGuides().size(), 4u);
    EXPECT_EQ(grammar_test::chartFaults(chart), "");
}

} // namespace

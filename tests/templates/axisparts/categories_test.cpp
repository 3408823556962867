// Category look-ups on the sample charts: categorical roles, domains, legend variables and the
// reverse look-up of relabelled categories.
#include "templates/TemplateSupport.h"

using namespace template_test;

namespace {

class Categories : public TemplateTest {
protected:
    GrxVisualization& chart = sample("simple-bar.xml");
    Probe probe{nullptr, chart};
    GrrUviza& graph = *byId<GrrUviza>(chart, "frame_graph_1");
    CTElementType& bar = *byId<CTElementType>(chart, "interval_1");
    CTVariableType& jobcat = *byId<CTVariableType>(chart, "var_jobcat");
    GrxCategoricalDomain& genders = *byId<GrxCategoricalDomain>(chart, "domain_gender");

    std::string domain(const char* role, const CTElementType* element) {
        const GrxCategoricalDomain* d = probe.getCategoricalDomain(graph, ChartString(role), element);
        return d ? u8(d->getId()) : "<none>";
    }
    std::string legendVariables(const char* role) {
        std::string out;
        for (const CTVariableType* v : probe.getLegendVariables(graph, ChartString(role)))
            out += u8(v->getId()) + " ";
        return out;
    }
    void relabel(GrxFormat& format, const char* from, const char* to) {
        GrxRelabel& r = format.addRelabel();
        r.setFrom(ChartString(from));
        r.setTo(ChartString(to));
    }
};

TEST_F(Categories, CategoricalMeansAClusterOrAVariableOfExactlyOne) {
    EXPECT_TRUE(probe.isRoleCategorical(graph, ChartString("x")));
    EXPECT_FALSE(probe.isRoleCategorical(graph, ChartString("y")));
    jobcat.setCategorical(2);
    EXPECT_FALSE(probe.isRoleCategorical(graph, ChartString("x")));
    // A cluster on x makes x categorical whatever its variables are.
    byId<GrxDimension>(chart, "dim_x")->setClusterVariable(jobcat);
    EXPECT_TRUE(probe.isRoleCategorical(graph, ChartString("x")));
    EXPECT_FALSE(probe.isRoleCategorical(graph, ChartString("z")));
}

TEST_F(Categories, DomainsFromTheElementFirstThenFromTheDimensions) {
    jobcat.setCategoricalDomain(genders);
    EXPECT_EQ(domain("x", &bar), "domain_gender"); // the element's x variable
    EXPECT_EQ(domain("x", nullptr), "domain_jobcat");
    byId<CTVariableType>(chart, "var_salary")->setCategoricalDomain(genders);
    EXPECT_EQ(domain("y", &bar), "<none>"); // y never asks the element
    EXPECT_EQ(domain("legend", nullptr), "<none>");
    EXPECT_EQ(domain("legend", &bar), "domain_jobcat"); // the colour's own domain
    // A style-by comes before any colour.
    bar.addStyleBy().setVariable(jobcat);
    EXPECT_EQ(domain("legend", &bar), "domain_gender");
}

TEST_F(Categories, LegendVariablesAreEveryAestheticVariableOrTheRoleVariable) {
    CTVariableType& gender = *byId<CTVariableType>(chart, "var_gender");
    bar.addShape().setVariable(gender);
    bar.addDash().setVariable(jobcat);
    EXPECT_EQ(legendVariables("legend"), "var_jobcat var_gender var_jobcat ");
    EXPECT_EQ(legendVariables("x"), "var_jobcat var_jobcat ");
    EXPECT_EQ(legendVariables("y"), "");
    byId<CTElementType>(chart, "interval_1")->getY()->setVariable(gender);
    EXPECT_EQ(legendVariables("y"), "var_gender ");
}

TEST_F(Categories, CategoryValueIsTheFirstRelabelToTheLabelInTheFirstFormat) {
    GrxFormat& first = jobcat.addFormat();
    relabel(first, "", "Staff");
    relabel(first, "1", "Staff");
    relabel(first, "2", "Clerks");
    relabel(first, "3", "Clerks");
    relabel(jobcat.addFormat(), "4", "Bosses");
    struct Row {
        const XMLCh* role;
        const char* label;
        const char* value;
    } rows[] = {{u"x", "Clerks", "2"}, {u"x", "clerks", ""}, {u"x", "Bosses", ""}, {u"x", "Staff", ""},
                {u"legend", "Clerks", ""}, {u"y", "Clerks", ""}};
    for (const Row& row : rows)
        EXPECT_EQ(probe.getCategoryValue(graph, row.role, ChartString(row.label)).toUTF8(), row.value)
            << u8(row.role) << " " << row.label;
    // On x a cluster variable answers instead of the element's variable.
    CTVariableType& gender = *byId<CTVariableType>(chart, "var_gender");
    relabel(gender.addFormat(), "f", "Women");
    EXPECT_EQ(probe.getCategoryValue(graph, u"x", ChartString("Women")).toUTF8(), "");
    byId<GrxDimension>(chart, "dim_x")->setClusterVariable(gender);
    EXPECT_EQ(probe.getCategoryValue(graph, u"x", ChartString("Women")).toUTF8(), "f");
    EXPECT_EQ(probe.getCategoryValue(graph, u"x", ChartString("Clerks")).toUTF8(), "");
}

} // namespace

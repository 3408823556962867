// Display settings: the default document, the option operations, templates and the text for the host.
#include "TreeSupport.h"

using namespace XERCES_CPP_NAMESPACE;

namespace {

const std::string kSettingsHead =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<displaySettings xmlns=\"http://plotaid.org/treeview/1.0\" "
    "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
    "xsi:schemaLocation=\"http://plotaid.org/treeview/1.0 "
    "http://plotaid.org/treeview/1.0/treeview-1.0.xsd\">";

std::string settings(const std::string& body) {
    return kSettingsHead + body + "</displaySettings>";
}

DOMElement* first(TestTree& tree, const char* name) {
    const auto found = elements(tree.displayDocument(), name);
    return found.empty() ? nullptr : found.front();
}

TEST(TreeDisplay, DefaultsHaveTheColours) {
    TestTree tree(example("credit-risk.xml"), "");
    ASSERT_NE(tree.displayDocument(), nullptr);
    DOMElement* colorData = first(tree, "colorData");
    EXPECT_EQ(attr(colorData, "bkndFill") + attr(colorData, "nodeFill") + attr(colorData, "stroke"),
              "#FFFFFFFF#FFFFFFFF#FF000000");
    EXPECT_NE(tree.SetupDisplayData().find("<treeZoom/>\n<treeOrientation/>\n"), std::string::npos);
}

TEST(TreeDisplay, OptionsSetOnlyValuesInRange) {
    TestTree tree("", settings(""));
    tree.SetZoomFactor(1);
    tree.SetZoomFactor(501);
    EXPECT_EQ(first(tree, "treeZoom"), nullptr) << "out-of-range zoom must not even create the element";
    for (int zoom : {2, 500, 0})
        tree.SetZoomFactor(zoom);
    EXPECT_EQ(attr(first(tree, "treeZoom"), "factor"), "500");

    tree.SetOrientation(static_cast<TreeTransformer::TreeOrientation>(3));
    tree.SetTreeDisplayOption(static_cast<TreeTransformer::TreeDisplayOption>(-1));
    ASSERT_NE(first(tree, "treeOrientation"), nullptr) << "the element is made before the check";
    EXPECT_EQ(attr(first(tree, "treeOrientation"), "orientation"), "<absent>");
    EXPECT_EQ(attr(first(tree, "nodeContents"), "contents"), "<absent>");
    tree.ShowNodeDefs(true);
    tree.ShowBranchStatistics(false);
    EXPECT_EQ(attr(first(tree, "predictorRanges"), "show"), "true");
    EXPECT_EQ(attr(first(tree, "branchStatistics"), "show"), "false");
    tree.applyFont("DejaVu Sans");
    EXPECT_EQ(attr(first(tree, "fontData"), "family"), "DejaVu Sans");
    // New elements land as the last children of the root.
    DOMElement* root = tree.displayDocument()->getDocumentElement();
    EXPECT_EQ(root->getLastElementChild(), first(tree, "fontData"));
    tree.SetOutputLanguage("en", "");
    EXPECT_EQ(attr(root, "olang"), "en");
    tree.SetOutputLanguage("de", "CH");
    tree.SetOutputLocale("fr", "CA");
    EXPECT_EQ(attr(root, "olang") + " " + attr(root, "locale"), "de-CH fr-CA");
}

TEST(TreeDisplay, ColoursOverwriteInOrderThenAppend) {
    TestTree tree("", "");
    // Fewer colours leave the later items as they were; none changes nothing; an unknown id is refused.
    const struct {
        TreeTransformer::ColorIds id;
        std::vector<std::string> colours;
        std::vector<std::string> chart, swatch;
    } steps[] = {
        {TreeTransformer::CHART_COLORS, {"#FF112233"}, {"#FF112233"}, {}},
        {TreeTransformer::CHART_COLORS, {"#FFAAAAAA", "#FFBBBBBB"}, {"#FFAAAAAA", "#FFBBBBBB"}, {}},
        {TreeTransformer::CHART_COLORS, {"#FFCCCCCC"}, {"#FFCCCCCC", "#FFBBBBBB"}, {}},
        {TreeTransformer::CHART_COLORS, {}, {"#FFCCCCCC", "#FFBBBBBB"}, {}},
        {TreeTransformer::SWATCH_COLORS, {"#FF000001"}, {"#FFCCCCCC", "#FFBBBBBB"}, {"#FF000001"}},
    };
    for (const auto& step : steps) {
        SCOPED_TRACE(&step - steps);
        tree.applyColors(step.id, step.colours);
        EXPECT_EQ(values(first(tree, "chartColors"), "colorItem", "value"), step.chart);
        EXPECT_EQ(values(first(tree, "swatchColors"), "colorItem", "value"), step.swatch);
    }
    EXPECT_EQ(elements(tree.displayDocument(), "colorItem").size(), 3u);
}

TEST(TreeDisplay, PredictorFormatsShareOneContainerAndTheTargetHasOneDate) {
    TestTree tree("", "");
    tree.addPredictorPrecision("age", 0);
    tree.addPredictorPrecision("income", 2);
    tree.addPredictorDate("opened", "ADATE", 10, 0);
    DOMElement* formats = first(tree, "predictorFormats");
    const auto items = elements(formats, "predictorItem");
    ASSERT_EQ(items.size(), 3u);
    EXPECT_EQ(values(formats, "predictorItem", "varName"),
              (std::vector<std::string>{"age", "income", "opened"}));
    EXPECT_EQ(values(formats, "predictorItem", "precision"),
              (std::vector<std::string>{"0", "2", "<absent>"}));
    EXPECT_EQ(first(tree, "statFormats"), tree.GetStatFormatElement());
    EXPECT_NE(tree.GetNewPredictorItem(), items[2]) << "every call adds an item";

    tree.addTargetDateFormat("DATETIME", 20, 0);
    tree.addTargetDateFormat("EDATE", 8, 1);
    std::vector<DOMElement*> dates = elements(first(tree, "statFormats"), "dateFormat");
    ASSERT_EQ(dates.size(), 2u);
    // The predictor's date format is not the target's.
    EXPECT_EQ(dates[0]->getParentNode(), items[2]);
    EXPECT_EQ(attr(dates[0], "name") + attr(dates[0], "width") + attr(dates[0], "precision"), "ADATE100");
    EXPECT_EQ(dates[1]->getParentNode(), first(tree, "statFormats"));
    EXPECT_EQ(attr(dates[1], "name") + attr(dates[1], "width") + attr(dates[1], "precision"), "EDATE81");
}

TEST(TreeDisplay, TemplatesAppendAfterExistingAndOptionsKeepTheFirst) {
    TestTree tree("", "");
    const std::string before = tree.getDisplayData(nullptr);
    engine_test::Records records;
    for (const std::string& bad : {std::string(), std::string("<displaySettings"), settings("<bogus/>"),
                                   example("house-prices.xml") /* valid XML, no display settings */})
        EXPECT_FALSE(tree.applyTemplate(bad)) << bad;
    EXPECT_EQ(tree.getDisplayData(nullptr), before);
    EXPECT_TRUE(mentions(records, "TreeTransformer::applyTemplate() fatal error"));

    ASSERT_TRUE(tree.applyTemplate(settings("<treeZoom factor=\"150\"/><fontData family=\"Serif\"/>")));
    tree.SetZoomFactor(75);
    EXPECT_EQ(values(tree.displayDocument(), "treeZoom", "factor"), (std::vector<std::string>{"75", "150"}));
    // Root attributes of the template are copied over.
    ASSERT_TRUE(tree.applyTemplate(kSettingsHead.substr(0, kSettingsHead.size() - 1) +
                                   " olang=\"ja\"><nodeState/></displaySettings>"));
    EXPECT_EQ(attr(tree.displayDocument()->getDocumentElement(), "olang"), "ja");
}

TEST(TreeDisplay, UnusableSettingsMakeOptionsHarmlessAndReportOnce) {
    for (const std::string& bad :
         {settings("<treeZoom factor=\"5\"/><unknown/>"), example("credit-risk.xml")}) {
        engine_test::Records records;
        TestTree tree("", bad);
        EXPECT_EQ(tree.displayDocument(), nullptr);
        EXPECT_FALSE(records.errors().empty());
        const std::size_t reported = records.errors().size();
        tree.SetOrientation(TreeTransformer::LEFT_TO_RIGHT);
        tree.SetTreeDisplayOption(TreeTransformer::BOTH);
        tree.SetZoomFactor(100);
        tree.ShowNodeDefs(true);
        tree.ShowBranchStatistics(true);
        tree.applyFont("Serif");
        tree.applyColors(TreeTransformer::CHART_COLORS, {"#FF000000"});
        tree.SetOutputLanguage("en", "US");
        tree.SetOutputLocale("en", "US");
        tree.addPredictorPrecision("x", 1);
        tree.addPredictorDate("x", "DATE", 8, 0);
        tree.addTargetDateFormat("DATE", 8, 0);
        EXPECT_EQ(tree.GetStatFormatElement(), nullptr);
        EXPECT_EQ(tree.GetNewPredictorItem(), nullptr);
        EXPECT_FALSE(tree.applyTemplate(settings("")));
        EXPECT_EQ(tree.getDisplayData(nullptr), "");
        EXPECT_EQ(records.errors().size(), reported + 1) << "only the refused template adds a record";
    }

    // Texts invalid in the host encoding set nothing.
    TestTree tree("", "");
    tree.applyFont("Serif");
    tree.applyFont(std::string("\xff\xfe", 2));
    EXPECT_EQ(attr(first(tree, "fontData"), "family"), "Serif");
    tree.addPredictorPrecision(std::string("\xc3", 1), 2);
    EXPECT_EQ(elements(tree.displayDocument(), "predictorItem").size(), 0u);
    tree.applyColors(TreeTransformer::CHART_COLORS, {"#FF000001", std::string("\xff", 1)});
    EXPECT_EQ(values(tree.displayDocument(), "colorItem", "value"), std::vector<std::string>{"#FF000001"});
    Reader reader;
    EXPECT_NE(reader.read(tree.getDisplayData(nullptr)), nullptr);
}

TEST(TreeDisplay, OutputValidatesCarriesTheOptionsAndTakesAnEncoding) {
    TestTree tree("", "");
    tree.SetZoomFactor(120);
    tree.SetOrientation(TreeTransformer::RIGHT_TO_LEFT);
    tree.SetTreeDisplayOption(TreeTransformer::GRAPH);
    tree.ShowNodeDefs(true);
    tree.applyFont("Caf\xc3\xa9");
    tree.applyColors(TreeTransformer::SWATCH_COLORS, {"#FF010203", "#FF040506"});
    tree.SetOutputLanguage("en", "GB");
    tree.addPredictorPrecision("age", 1);
    tree.addPredictorDate("opened", "ADATE", 10, 0);
    tree.addTargetDateFormat("SDATE", 10, 0);
    ASSERT_TRUE(tree.applyTemplate(settings("<treeZoom factor=\"300\"/>")));

    const std::string text = tree.getDisplayData(nullptr);
    Reader reader;
    DOMDocument* document = reader.read(text);
    ASSERT_NE(document, nullptr) << (reader.errors().empty() ? text : reader.errors().front());
    EXPECT_EQ(values(document, "treeZoom", "factor"), (std::vector<std::string>{"120", "300"}));
    EXPECT_EQ(values(document, "treeOrientation", "orientation"), std::vector<std::string>{"right-to-left"});
    EXPECT_EQ(values(document, "nodeContents", "contents"), std::vector<std::string>{"graph"});
    EXPECT_NE(text.find("\n  <treeZoom"), std::string::npos) << "printed with white space";
    EXPECT_EQ(grammar_test::lintFaults("treeview-1.0.xsd", text), "");

    const std::string latin1 = tree.getDisplayData(u"ISO-8859-1");
    EXPECT_NE(latin1.find("encoding=\"ISO-8859-1\""), std::string::npos);
    EXPECT_NE(latin1.find("Caf\xe9\""), std::string::npos);
    const std::string utf16 = tree.getDisplayData(u"UTF-16");
    ASSERT_GE(utf16.size(), 4u);
    EXPECT_EQ(utf16.size() % 2, 0u);
    EXPECT_EQ(utf16.find("displaySettings"), std::string::npos) << "no 8-bit text in UTF-16 output";
    EXPECT_EQ(tree.getDisplayData(u"no-such-encoding"), "");
}

} // namespace

// Display settings: the default document, the option operations, templates and the text for the host.
#include "TreeSupport.h"

using namespace XERCES_CPP_NAMESPACE;

namespace {

const std::string kSettingsHead = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                                  "<displaySettings xmlns=\"http://plotaid.org/treeview/1.0\" "
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

std::vector<std::string> values(const DOMNode* under, const char* name, const char* attribute) {
    std::vector<std::string> out;
    for (const DOMElement* e : elements(under, name))
        out.push_back(attr(e, attribute));
    return out;
}

TEST(TreeDisplay, DefaultsHaveTheRootChildrenInOrderWithColours) {
    TestTree tree(example("credit-risk.xml"), "");
    ASSERT_NE(tree.displayDocument(), nullptr);
    DOMElement* root = tree.displayDocument()->getDocumentElement();
    EXPECT_EQ(u8(root->getNamespaceURI()), "http://plotaid.org/treeview/1.0");
    EXPECT_EQ(attr(root, "xsi:schemaLocation"),
              "http://plotaid.org/treeview/1.0 http://plotaid.org/treeview/1.0/treeview-1.0.xsd");
    std::vector<std::string> names;
    for (DOMElement* child = root->getFirstElementChild(); child; child = child->getNextElementSibling())
        names.push_back(u8(child->getLocalName()));
    EXPECT_EQ(names,
              (std::vector<std::string>{"treeZoom", "treeOrientation", "nodeContents", "nodeState",
                                        "predictorRanges", "branchStatistics", "fontData", "colorData"}));
    DOMElement* colorData = first(tree, "colorData");
    EXPECT_EQ(attr(colorData, "bkndFill"), "#FFFFFFFF");
    EXPECT_EQ(attr(colorData, "nodeFill"), "#FFFFFFFF");
    EXPECT_EQ(attr(colorData, "stroke"), "#FF000000");
    EXPECT_EQ(elements(colorData, "chartColors").size(), 1u);
    EXPECT_EQ(elements(colorData, "swatchColors").size(), 1u);
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
    const char* orientations[] = {"top-down", "left-to-right", "right-to-left"};
    const char* contents[] = {"table", "graph", "both"};
    for (int i = 0; i < 3; ++i) {
        tree.SetOrientation(static_cast<TreeTransformer::TreeOrientation>(i));
        tree.SetTreeDisplayOption(static_cast<TreeTransformer::TreeDisplayOption>(i));
        EXPECT_EQ(attr(first(tree, "treeOrientation"), "orientation"), orientations[i]);
        EXPECT_EQ(attr(first(tree, "nodeContents"), "contents"), contents[i]);
    }
    tree.ShowNodeDefs(true);
    tree.ShowBranchStatistics(false);
    EXPECT_EQ(attr(first(tree, "predictorRanges"), "show"), "true");
    EXPECT_EQ(attr(first(tree, "branchStatistics"), "show"), "false");
    tree.applyFont("DejaVu Sans");
    EXPECT_EQ(attr(first(tree, "fontData"), "family"), "DejaVu Sans");
    // New elements land in the document's namespace, as the last children of the root.
    EXPECT_EQ(u8(first(tree, "fontData")->getNamespaceURI()), "http://plotaid.org/treeview/1.0");
    EXPECT_EQ(tree.displayDocument()->getDocumentElement()->getLastElementChild(), first(tree, "fontData"));

    DOMElement* root = tree.displayDocument()->getDocumentElement();
    tree.SetOutputLanguage("en", "");
    EXPECT_EQ(attr(root, "olang"), "en");
    tree.SetOutputLanguage("de", "CH");
    tree.SetOutputLocale("fr", "CA");
    EXPECT_EQ(attr(root, "olang"), "de-CH");
    EXPECT_EQ(attr(root, "locale"), "fr-CA");
}

TEST(TreeDisplay, ColoursOverwriteInOrderThenAppend) {
    TestTree tree("", "");
    tree.applyColors(TreeTransformer::CHART_COLORS, {"#FF112233"});
    DOMElement* chart = first(tree, "chartColors");
    ASSERT_NE(chart, nullptr);
    EXPECT_EQ(u8(chart->getParentNode()->getLocalName()), "colorData");
    EXPECT_EQ(values(chart, "colorItem", "value"), std::vector<std::string>{"#FF112233"});
    tree.applyColors(TreeTransformer::CHART_COLORS, {"#FFAAAAAA", "#FFBBBBBB"});
    EXPECT_EQ(values(chart, "colorItem", "value"), (std::vector<std::string>{"#FFAAAAAA", "#FFBBBBBB"}));
    // Fewer colours leave the later items as they were; none changes nothing.
    tree.applyColors(TreeTransformer::CHART_COLORS, {"#FFCCCCCC"});
    tree.applyColors(TreeTransformer::CHART_COLORS, {});
    EXPECT_EQ(values(chart, "colorItem", "value"), (std::vector<std::string>{"#FFCCCCCC", "#FFBBBBBB"}));
    tree.applyColors(TreeTransformer::SWATCH_COLORS, {"#FF000001"});
    tree.applyColors(static_cast<TreeTransformer::ColorIds>(2), {"#FF000002"});
    EXPECT_EQ(values(first(tree, "swatchColors"), "colorItem", "value"),
              std::vector<std::string>{"#FF000001"});
    EXPECT_EQ(elements(tree.displayDocument(), "colorItem").size(), 3u);
}

TEST(TreeDisplay, PredictorFormatsShareOneContainerAndTheTargetHasOneDate) {
    TestTree tree("", "");
    tree.addPredictorPrecision("age", 0);
    tree.addPredictorPrecision("income", 2);
    tree.addPredictorDate("opened", "ADATE", 10, 0);
    ASSERT_EQ(elements(tree.displayDocument(), "statFormats").size(), 1u);
    ASSERT_EQ(elements(tree.displayDocument(), "predictorFormats").size(), 1u);
    const auto items = elements(first(tree, "predictorFormats"), "predictorItem");
    ASSERT_EQ(items.size(), 3u);
    EXPECT_EQ(values(first(tree, "predictorFormats"), "predictorItem", "varName"),
              (std::vector<std::string>{"age", "income", "opened"}));
    EXPECT_EQ(values(first(tree, "predictorFormats"), "predictorItem", "precision"),
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
    TempDir logs;
    ScopedEnv log("DumpChartXMLPath", logs.path());
    TestTree tree("", "");
    const std::string before = tree.getDisplayData(nullptr);
    EXPECT_FALSE(tree.applyTemplate(""));
    EXPECT_FALSE(tree.applyTemplate("<displaySettings"));
    EXPECT_FALSE(tree.applyTemplate(settings("<bogus/>")));
    EXPECT_FALSE(tree.applyTemplate(example("house-prices.xml"))) << "valid XML, but not display settings";
    EXPECT_EQ(tree.getDisplayData(nullptr), before);
    EXPECT_NE(readAll(logs.file("chartxml_error.log")).find("TreeTransformer::applyTemplate() fatal error"),
              std::string::npos);

    ASSERT_TRUE(tree.applyTemplate(settings("<treeZoom factor=\"150\"/><fontData family=\"Serif\"/>")));
    tree.SetZoomFactor(75);
    EXPECT_EQ(values(tree.displayDocument(), "treeZoom", "factor"), (std::vector<std::string>{"75", "150"}));
    // Root attributes of the template are copied over.
    ASSERT_TRUE(tree.applyTemplate(kSettingsHead.substr(0, kSettingsHead.size() - 1) +
                                   " olang=\"ja\"><nodeState/></displaySettings>"));
    EXPECT_EQ(attr(tree.displayDocument()->getDocumentElement(), "olang"), "ja");
}

TEST(TreeDisplay, UnusableSettingsMakeOptionsHarmlessAndReportOnce) {
    TempDir logs;
    ScopedEnv log("DumpChartXMLPath", logs.path());
    for (const std::string& bad :
         {settings("<treeZoom factor=\"5\"/><unknown/>"), example("credit-risk.xml")}) {
        TestTree tree("", bad);
        EXPECT_EQ(tree.displayDocument(), nullptr);
        const int reported = records(readAll(logs.file("chartxml_error.log")));
        EXPECT_GT(reported, 0);
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
        // Only the refused template adds a record.
        EXPECT_EQ(records(readAll(logs.file("chartxml_error.log"))), reported + 1);
    }
    EXPECT_NE(readAll(logs.file("chartxml_error.log")).find("TreeTransformer::parseDocument() fatal error"),
              std::string::npos);

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
    EXPECT_NE(text.find("\n  <treeZoom"), std::string::npos) << "printed with white space";
    EXPECT_EQ(xmllint(text, "treeview-1.0.xsd"), 0);

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

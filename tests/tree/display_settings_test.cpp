// Display settings: the default document, the option operations, templates and the text for the host.
#include "TreeSupport.h"

#include <gtest/gtest.h>

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

TEST(TreeDisplayDefaults, RootChildrenInOrderWithColours) {
    TestTree tree(example("credit-risk.xml"), "");
    DOMDocument* document = tree.displayDocument();
    ASSERT_NE(document, nullptr);
    DOMElement* root = document->getDocumentElement();
    EXPECT_EQ(u8(root->getLocalName()), "displaySettings");
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
    // One element a line.
    EXPECT_NE(tree.SetupDisplayData().find("<treeZoom/>\n<treeOrientation/>\n"), std::string::npos);
}

TEST(TreeDisplayOptions, ZoomOnlyWithinTwoToFiveHundred) {
    TestTree tree("", settings(""));
    tree.SetZoomFactor(1);
    tree.SetZoomFactor(501);
    EXPECT_EQ(first(tree, "treeZoom"), nullptr) << "out-of-range zoom must not even create the element";
    tree.SetZoomFactor(2);
    EXPECT_EQ(attr(first(tree, "treeZoom"), "factor"), "2");
    tree.SetZoomFactor(500);
    EXPECT_EQ(attr(first(tree, "treeZoom"), "factor"), "500");
    tree.SetZoomFactor(0);
    EXPECT_EQ(attr(first(tree, "treeZoom"), "factor"), "500");
}

TEST(TreeDisplayOptions, EnumeratedValuesAndOutOfRange) {
    TestTree tree("", settings(""));
    tree.SetOrientation(static_cast<TreeTransformer::TreeOrientation>(3));
    tree.SetTreeDisplayOption(static_cast<TreeTransformer::TreeDisplayOption>(-1));
    ASSERT_NE(first(tree, "treeOrientation"), nullptr) << "the element is found (made) before the check";
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
    tree.ShowNodeDefs(false);
    EXPECT_EQ(attr(first(tree, "predictorRanges"), "show"), "false");
    tree.applyFont("DejaVu Sans");
    EXPECT_EQ(attr(first(tree, "fontData"), "family"), "DejaVu Sans");
    // New elements land in the document's namespace, as the last children of the root.
    EXPECT_EQ(u8(first(tree, "fontData")->getNamespaceURI()), "http://plotaid.org/treeview/1.0");
    EXPECT_EQ(tree.displayDocument()->getDocumentElement()->getLastElementChild(), first(tree, "fontData"));
}

TEST(TreeDisplayOptions, ColoursOverwriteInOrderThenAppend) {
    TestTree tree("", "");
    tree.applyColors(TreeTransformer::CHART_COLORS, {"#FF112233"});
    DOMElement* chart = first(tree, "chartColors");
    ASSERT_NE(chart, nullptr);
    EXPECT_EQ(u8(static_cast<DOMElement*>(chart->getParentNode())->getLocalName()), "colorData");
    auto items = elements(chart, "colorItem");
    ASSERT_EQ(items.size(), 1u);
    EXPECT_EQ(attr(items[0], "value"), "#FF112233");

    tree.applyColors(TreeTransformer::CHART_COLORS, {"#FFAAAAAA", "#FFBBBBBB"});
    items = elements(chart, "colorItem");
    ASSERT_EQ(items.size(), 2u);
    EXPECT_EQ(attr(items[0], "value"), "#FFAAAAAA");
    EXPECT_EQ(attr(items[1], "value"), "#FFBBBBBB");

    // Fewer colours leave the later items as they were; none changes nothing.
    tree.applyColors(TreeTransformer::CHART_COLORS, {"#FFCCCCCC"});
    tree.applyColors(TreeTransformer::CHART_COLORS, {});
    items = elements(chart, "colorItem");
    ASSERT_EQ(items.size(), 2u);
    EXPECT_EQ(attr(items[0], "value"), "#FFCCCCCC");
    EXPECT_EQ(attr(items[1], "value"), "#FFBBBBBB");

    tree.applyColors(TreeTransformer::SWATCH_COLORS, {"#FF000001"});
    tree.applyColors(static_cast<TreeTransformer::ColorIds>(2), {"#FF000002"});
    EXPECT_EQ(elements(first(tree, "swatchColors"), "colorItem").size(), 1u);
    EXPECT_EQ(elements(tree.displayDocument(), "colorItem").size(), 3u);
}

TEST(TreeDisplayOptions, LanguageAndLocaleOnTheRoot) {
    TestTree tree("", "");
    DOMElement* root = tree.displayDocument()->getDocumentElement();
    tree.SetOutputLanguage("en", "");
    EXPECT_EQ(attr(root, "olang"), "en");
    tree.SetOutputLanguage("de", "CH");
    EXPECT_EQ(attr(root, "olang"), "de-CH");
    tree.SetOutputLocale("fr", "CA");
    EXPECT_EQ(attr(root, "locale"), "fr-CA");
    EXPECT_EQ(attr(root, "olang"), "de-CH");
}

TEST(TreeDisplayFormats, PredictorItemsShareOneContainer) {
    TestTree tree("", "");
    tree.addPredictorPrecision("age", 0);
    tree.addPredictorPrecision("income", 2);
    tree.addPredictorPrecision("age", -3);
    ASSERT_EQ(elements(tree.displayDocument(), "statFormats").size(), 1u);
    ASSERT_EQ(elements(tree.displayDocument(), "predictorFormats").size(), 1u);
    const auto items = elements(first(tree, "predictorFormats"), "predictorItem");
    ASSERT_EQ(items.size(), 3u);
    EXPECT_EQ(attr(items[1], "varName"), "income");
    EXPECT_EQ(attr(items[1], "precision"), "2");
    EXPECT_EQ(attr(items[2], "precision"), "-3");
    EXPECT_EQ(first(tree, "statFormats"), tree.GetStatFormatElement());
    EXPECT_NE(tree.GetNewPredictorItem(), items[2]) << "every call adds an item";
}

TEST(TreeDisplayFormats, DatesOfPredictorsAndTarget) {
    TestTree tree("", "");
    tree.addPredictorDate("opened", "ADATE", 10, 0);
    const auto item = elements(first(tree, "predictorFormats"), "predictorItem");
    ASSERT_EQ(item.size(), 1u);
    EXPECT_EQ(attr(item[0], "varName"), "opened");
    EXPECT_EQ(attr(item[0], "precision"), "<absent>");
    const auto date = elements(item[0], "dateFormat");
    ASSERT_EQ(date.size(), 1u);
    EXPECT_EQ(attr(date[0], "name"), "ADATE");
    EXPECT_EQ(attr(date[0], "width"), "10");
    EXPECT_EQ(attr(date[0], "precision"), "0");

    tree.addTargetDateFormat("DATETIME", 20, 0);
    tree.addTargetDateFormat("EDATE", 8, 1);
    DOMElement* statFormats = first(tree, "statFormats");
    std::vector<DOMElement*> targets;
    for (DOMElement* c = statFormats->getFirstElementChild(); c; c = c->getNextElementSibling())
        if (u8(c->getLocalName()) == "dateFormat")
            targets.push_back(c);
    ASSERT_EQ(targets.size(), 1u);
    EXPECT_EQ(attr(targets[0], "name"), "EDATE");
    EXPECT_EQ(attr(targets[0], "width"), "8");
    EXPECT_EQ(attr(targets[0], "precision"), "1");
    EXPECT_EQ(attr(date[0], "name"), "ADATE") << "the predictor's date format is not the target's";
}

TEST(TreeDisplayTemplate, AppendsAfterExistingAndOptionsKeepTheFirst) {
    TestTree tree("", "");
    EXPECT_FALSE(tree.applyTemplate(""));
    ASSERT_TRUE(tree.applyTemplate(settings("<treeZoom factor=\"150\"/><fontData family=\"Serif\"/>")));
    auto zooms = elements(tree.displayDocument(), "treeZoom");
    ASSERT_EQ(zooms.size(), 2u);
    EXPECT_EQ(attr(zooms[1], "factor"), "150");
    tree.SetZoomFactor(75);
    EXPECT_EQ(attr(zooms[0], "factor"), "75");
    EXPECT_EQ(attr(zooms[1], "factor"), "150");
    // Root attributes of the template are copied over.
    ASSERT_TRUE(tree.applyTemplate(kSettingsHead.substr(0, kSettingsHead.size() - 1) +
                                   " olang=\"ja\"><nodeState/></displaySettings>"));
    EXPECT_EQ(attr(tree.displayDocument()->getDocumentElement(), "olang"), "ja");
}

TEST(TreeDisplayTemplate, InvalidOrForeignTemplatesAreRefused) {
    TempDir logs;
    ScopedEnv log("DumpChartXMLPath", logs.path());
    TestTree tree("", "");
    const std::string before = tree.getDisplayData(nullptr);
    EXPECT_FALSE(tree.applyTemplate("<displaySettings"));
    EXPECT_FALSE(tree.applyTemplate(settings("<bogus/>")));
    EXPECT_FALSE(tree.applyTemplate(example("house-prices.xml"))) << "valid XML, but not display settings";
    EXPECT_EQ(tree.getDisplayData(nullptr), before);
    EXPECT_NE(readAll(logs.file("chartxml_error.log")).find("TreeTransformer::applyTemplate() fatal error"),
              std::string::npos);
}

TEST(TreeDisplayFailure, UnparsableSettingsMakeOptionsHarmlessAndReportOnce) {
    TempDir logs;
    ScopedEnv log("DumpChartXMLPath", logs.path());
    TestTree tree("", settings("<treeZoom factor=\"5\"/><unknown/>"));
    EXPECT_EQ(tree.displayDocument(), nullptr);
    const std::string logText = readAll(logs.file("chartxml_error.log"));
    EXPECT_NE(logText.find("TreeTransformer::parseDocument() fatal error"), std::string::npos);
    const int reported = records(logText);

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
    const std::string after = readAll(logs.file("chartxml_error.log"));
    // Only the refused template adds a record.
    EXPECT_EQ(records(after), reported + 1) << after;
}

TEST(TreeDisplayFailure, ForeignRootIsNotTakenForSettings) {
    TestTree tree("", example("credit-risk.xml"));
    EXPECT_EQ(tree.displayDocument(), nullptr);
    tree.SetZoomFactor(100);
    EXPECT_EQ(tree.getDisplayData(nullptr), "");
}

TEST(TreeDisplayFailure, TextsInvalidInTheHostEncodingSetNothing) {
    TestTree tree("", "");
    tree.applyFont("Serif");
    tree.applyFont(std::string("\xff\xfe", 2));
    EXPECT_EQ(attr(first(tree, "fontData"), "family"), "Serif");
    tree.addPredictorPrecision(std::string("\xc3", 1), 2);
    EXPECT_EQ(elements(tree.displayDocument(), "predictorItem").size(), 0u);
}

TEST(TreeDisplayData, OutputValidatesAndCarriesTheOptions) {
    TestTree tree("", "");
    tree.SetZoomFactor(120);
    tree.SetOrientation(TreeTransformer::RIGHT_TO_LEFT);
    tree.SetTreeDisplayOption(TreeTransformer::GRAPH);
    tree.ShowNodeDefs(true);
    tree.applyFont("Noto Sans \xc3\xa9");
    tree.applyColors(TreeTransformer::SWATCH_COLORS, {"#FF010203", "#FF040506"});
    tree.SetOutputLanguage("en", "GB");
    tree.addPredictorPrecision("age", 1);
    tree.addPredictorDate("opened", "ADATE", 10, 0);
    tree.addTargetDateFormat("SDATE", 10, 0);
    ASSERT_TRUE(tree.applyTemplate(settings("<treeZoom factor=\"300\"/>")));

    const std::string text = tree.getDisplayData(nullptr);
    ASSERT_FALSE(text.empty());
    Reader reader;
    DOMDocument* document = reader.read(text);
    ASSERT_NE(document, nullptr) << (reader.errors().empty() ? text : reader.errors().front());
    DOMElement* root = document->getDocumentElement();
    EXPECT_EQ(u8(root->getNamespaceURI()), "http://plotaid.org/treeview/1.0");
    EXPECT_EQ(attr(root, "olang"), "en-GB");
    EXPECT_EQ(attr(elements(root, "treeZoom").at(0), "factor"), "120");
    EXPECT_EQ(attr(elements(root, "treeZoom").at(1), "factor"), "300");
    EXPECT_EQ(attr(elements(root, "fontData").at(0), "family"), "Noto Sans \xc3\xa9");
    EXPECT_EQ(elements(root, "colorItem").size(), 2u);
    EXPECT_EQ(elements(root, "predictorItem").size(), 2u);
    EXPECT_NE(text.find("\n  <treeZoom"), std::string::npos) << "printed with white space";

    if (!haveXmllint())
        GTEST_SKIP() << "xmllint is not installed";
    TempDir dir;
    std::ofstream(dir.file("settings.xml"), std::ios::binary) << text;
    EXPECT_EQ(xmllint(dir.file("settings.xml"), "treeview-1.0.xsd"), 0) << text;
}

TEST(TreeDisplayData, RequestedEncoding) {
    TestTree tree("", "");
    tree.applyFont("Caf\xc3\xa9");
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

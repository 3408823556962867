#include "support/EngineSupport.h"

#include "../foundation/FoundationSupport.h"

#include <grx/ChartPrinter.h>

#include <xercesc/dom/DOM.hpp>

#include <clocale>
#include <limits>
#include <locale>

using namespace XERCES_CPP_NAMESPACE;
using engine_test::Chart;
using engine_test::EngineTest;
using engine_test::Records;

namespace {

// A builder with its protected operations opened up for the tests.
class Builder : public ChartBase {
public:
    using ChartBase::addStyle;
    using ChartBase::insertBeforeSiblings;
    using ChartBase::parseDocument;
    void setDocument(DOMDocument* d) { document_ = d; }
    void setDecimalPoint(char c) { decimalPoint_ = c; }
};

std::string utf8(const XMLCh* s) {
    return ChartString(s).toUTF8();
}

std::string printed(const DOMDocument* d) {
    std::ostringstream out;
    ChartPrinter().Print(d, out);
    return out.str();
}

const char* const kBrokenChart = "<?xml version=\"1.0\"?>\n"
                                 "<visualization xmlns=\"http://plotaid.org/grxml\" "
                                 "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
                                 "xsi:schemaLocation=\"http://plotaid.org/grxml "
                                 "http://plotaid.org/grxml/grxml-2.9.xsd\"><bogus/></visualization>";

using ChartBaseVocabulary = EngineTest;

TEST_F(ChartBaseVocabulary, OwnTextsAndNamespaces) {
    EXPECT_EQ(utf8(ChartBase::_container), "c-o-n-t-a-i-n-er");
    EXPECT_EQ(utf8(ChartBase::_equal), " = ");
    EXPECT_EQ(utf8(ChartBase::_frame_graph_1), "frame_graph_1");
    EXPECT_EQ(utf8(ChartBase::_controlchart_Center_Step_LCL), "controlchart_Center_Step_LCL");
    EXPECT_EQ(utf8(ChartBase::_simplebar), utf8(ChartBase::_stackedbar));
    EXPECT_EQ(utf8(ChartBase::_namespaceURI), "xmlns:http://plotaid.org/grxml");
    EXPECT_EQ(utf8(ChartBase::_schemaLocationValue),
              "http://plotaid.org/grxml http://plotaid.org/grxml/grxml-2.9.xsd");
    EXPECT_EQ(utf8(ChartBase::_schemaDataLocationValue),
              "http://plotaid.org/grxml/data http://plotaid.org/grxml/data/grxml-data-2.1.xsd");
    EXPECT_EQ(utf8(ChartBase::_validation_feature), "http://xml.org/sax/features/validation");
}

using ChartBaseDocuments = EngineTest;

TEST_F(ChartBaseDocuments, NewVisualizationIsInTheChartNamespaceAndValidates) {
    DOMDocument* d = ChartBase::createGrxDocument(ChartBase::_utf8);
    ASSERT_NE(d, nullptr);
    const DOMElement* root = d->getDocumentElement();
    EXPECT_EQ(utf8(root->getLocalName()), "visualization");
    EXPECT_EQ(utf8(root->getNamespaceURI()), "http://plotaid.org/grxml");
    EXPECT_EQ(utf8(root->getAttribute(u"xsi:schemaLocation")),
              "http://plotaid.org/grxml http://plotaid.org/grxml/grxml-2.9.xsd");
    EXPECT_EQ(utf8(d->getXmlVersion()), "1.0");
    EXPECT_FALSE(d->getXmlStandalone());
    // What the library makes, it can read back.
    EXPECT_TRUE(ChartBase::ValidXML(printed(d)));
    ChartBase::releaseDocument(d);
    ChartBase::releaseDocument(nullptr);
}

TEST_F(ChartBaseDocuments, OlderFormRootNamesItsOwnGrammar) {
    DOMDocument* d = ChartBase::createDocument(ChartBase::_utf16);
    ASSERT_NE(d, nullptr);
    EXPECT_EQ(utf8(d->getDocumentElement()->getLocalName()), "graph");
    EXPECT_EQ(utf8(d->getDocumentElement()->getAttribute(u"xsi:schemaLocation")),
              "http://plotaid.org/grxml http://plotaid.org/grxml/grxml-1.4.xsd");
    ChartBase::releaseDocument(d);
}

TEST_F(ChartBaseDocuments, SampleChartsParseAndBrokenOnesAreRefusedWithOneRecordAndADump) {
    foundation_test::DumpFolder dumps(std::string("0000000001"));
    Builder builder;
    EXPECT_NE(builder.parseDocument(engine_test::example("charts/simple-bar.xml")), nullptr);
    EXPECT_TRUE(ChartBase::ValidXML(engine_test::example("charts/histogram.xml")));

    Records records;
    EXPECT_EQ(builder.parseDocument(kBrokenChart), nullptr);
    EXPECT_FALSE(ChartBase::ValidXML(kBrokenChart));
    EXPECT_FALSE(ChartBase::ValidXML(""));
    const auto errors = records.errors();
    EXPECT_NE(std::find(errors.begin(), errors.end(), "parseDocument fatal error while parsing"),
              errors.end());
    EXPECT_NE(std::find(errors.begin(), errors.end(), "XML stream validation error"), errors.end());
    EXPECT_EQ(engine_test::readText(dumps.dir().file("parseError_00.xml")).substr(0, 21),
              "<?xml version=\"1.0\"?>");
}

TEST_F(ChartBaseDocuments, BuildersAreNotCopyable) {
    EXPECT_FALSE(std::is_copy_constructible<Builder>::value);
    EXPECT_FALSE(std::is_copy_assignable<Builder>::value);
}

class ChartBaseEdits : public EngineTest {
protected:
    void SetUp() override {
        chart_ = Chart::empty();
        builder_.setDocument(chart_.document());
        root_ = chart_.document()->getDocumentElement();
    }
    DOMElement* element(const XMLCh* name) {
        DOMElement* e = chart_.document()->createElementNS(root_->getNamespaceURI(), name);
        root_->appendChild(e);
        return e;
    }
    Chart chart_;
    Builder builder_;
    DOMElement* root_ = nullptr;
};

TEST_F(ChartBaseEdits, AttributesNeedAValueButMayBeEmpty) {
    DOMElement* e = element(u"style");
    Records records;
    EXPECT_EQ(builder_.AddAttribute(e, u"color", nullptr), -1);
    EXPECT_FALSE(e->hasAttribute(u"color"));
    ASSERT_EQ(records.errors().size(), 1u);
    EXPECT_EQ(records.errors()[0], "attribute value is empty for name color");
    EXPECT_EQ(builder_.AddAttribute(e, u"color", u""), 0);
    EXPECT_TRUE(e->hasAttribute(u"color"));
    EXPECT_EQ(ChartBase::AddAttributeDoc(chart_.document(), e, u"bad name", u"x"), -1);
    EXPECT_EQ(records.errors().back(), "attribute name does not exist bad name x");
}

TEST_F(ChartBaseEdits, DuplicateIdIsLoggedAndTheLaterElementAnswers) {
    DOMElement* first = element(u"style");
    DOMElement* second = element(u"style");
    Records records;
    EXPECT_TRUE(builder_.AddID(first, u"s1"));
    EXPECT_EQ(chart_.document()->getElementById(u"s1"), first);
    EXPECT_TRUE(builder_.AddID(second, u"s1"));
    EXPECT_EQ(chart_.document()->getElementById(u"s1"), second);
    ASSERT_EQ(records.errors().size(), 1u);
    EXPECT_EQ(records.errors()[0], "Attempting to add an existing ID to an element (s1 style)");
    EXPECT_FALSE(builder_.AddID(first, u""));
    EXPECT_EQ(records.errors().back(), "ID name attribute is empty for element style");
}

TEST_F(ChartBaseEdits, WrappedElementsKeepTheObjectModelsIdRegistration) {
    GrxStyle& a = chart_.vis->addStyle();
    GrxStyle& b = chart_.vis->addStyle();
    EXPECT_TRUE(builder_.AddID(a.getImplementation(), u"dup"));
    EXPECT_TRUE(builder_.AddID(b.getImplementation(), u"dup"));
    EXPECT_EQ(chart_.vis->getStyleById(u"dup"), &b);
}

TEST_F(ChartBaseEdits, UniqueIdsTakeTheFirstFreeNumber) {
    chart_.vis->addStyle().setId(u"style1");
    chart_.vis->addStyle().setId(u"style2");
    EXPECT_EQ(ChartBase::CreateUniqueId(ChartString("style"), *chart_.vis).toUTF8(), "style3");
    // Unused, so it is handed out again.
    EXPECT_EQ(ChartBase::CreateUniqueId(ChartString("style"), *chart_.vis).toUTF8(), "style3");
    chart_.vis->addStyle().setId(u"style3");
    chart_.vis->addStyle().setId(u"style5");
    EXPECT_EQ(ChartBase::CreateUniqueId(ChartString("style"), *chart_.vis).toUTF8(), "style4");
    EXPECT_EQ(ChartBase::CreateUniqueId(ChartString("other"), *chart_.vis).toUTF8(), "other1");
    EXPECT_EQ(ChartBase::CreateUniqueId(ChartString(), *chart_.vis).toUTF8(), "id1");
}

TEST_F(ChartBaseEdits, UniqueIdsStayExactAfterTheLastOneIsRemoved) {
    std::vector<GrxStyle*> styles;
    for (int i = 0; i < 50; ++i) {
        GrxStyle& s = chart_.vis->addStyle();
        s.setId(ChartBase::CreateUniqueId(ChartString("s"), *chart_.vis));
        styles.push_back(&s);
    }
    EXPECT_EQ(utf8(styles.back()->getId()), "s50");
    chart_.vis->removeChild(*styles.back());
    EXPECT_EQ(ChartBase::CreateUniqueId(ChartString("s"), *chart_.vis).toUTF8(), "s50");
    // A new document at another (or the same) address starts from 1.
    Chart other = Chart::empty();
    EXPECT_EQ(ChartBase::CreateUniqueId(ChartString("s"), *other.vis).toUTF8(), "s1");
}

TEST_F(ChartBaseEdits, AttributesMergeOverTheTarget) {
    DOMElement* from = element(u"style");
    DOMElement* to = element(u"style");
    from->setAttribute(u"color", u"red");
    from->setAttribute(u"margin", u"2pt");
    to->setAttribute(u"color", u"blue");
    to->setAttribute(u"padding", u"1pt");
    EXPECT_TRUE(ChartBase::mergeAttributes(from, to));
    EXPECT_EQ(utf8(to->getAttribute(u"color")), "red");
    EXPECT_EQ(utf8(to->getAttribute(u"margin")), "2pt");
    EXPECT_EQ(utf8(to->getAttribute(u"padding")), "1pt");
    EXPECT_FALSE(ChartBase::mergeAttributes(nullptr, to));
    EXPECT_FALSE(ChartBase::mergeAttributes(from, nullptr));
}

TEST_F(ChartBaseEdits, SearchFindsDirectChildrenAndAttributesInDocumentOrder) {
    DOMElement* a = element(u"style");
    DOMElement* b = element(u"style");
    DOMElement* nested = chart_.document()->createElementNS(root_->getNamespaceURI(), u"label");
    a->appendChild(nested);
    a->setAttribute(u"color", u"red");
    b->setAttribute(u"color", u"red");
    EXPECT_EQ(ChartBase::getChildByTagName(root_, u"style"), a);
    EXPECT_EQ(ChartBase::getChildByTagName(root_, u"label"), nullptr);
    EXPECT_EQ(ChartBase::getChildByTagName(nullptr, u"style"), nullptr);
    EXPECT_EQ(builder_.getElementWithAttribute(u"style", u"color", u"red"), a);
    EXPECT_EQ(builder_.getElementWithAttribute(u"style", u"color", u"green"), nullptr);
}

TEST_F(ChartBaseEdits, RemovingChildrenCountsTextAndElements) {
    DOMElement* e = element(u"label");
    e->appendChild(chart_.document()->createTextNode(u"a"));
    e->appendChild(chart_.document()->createElementNS(root_->getNamespaceURI(), u"text"));
    e->appendChild(chart_.document()->createTextNode(u"b"));
    EXPECT_EQ(builder_.removeAllChildren(e), 3u);
    EXPECT_EQ(e->getFirstChild(), nullptr);
    EXPECT_EQ(builder_.removeAllChildren(nullptr), 0u);
}

TEST_F(ChartBaseEdits, StylesAreFoundAtAnyDepthOrAppended) {
    DOMElement* holder = element(u"style");
    DOMElement* inner = builder_.addStyle(holder, u"inner");
    ASSERT_NE(inner, nullptr);
    EXPECT_EQ(inner->getParentNode(), holder);
    EXPECT_EQ(builder_.addStyle(root_, u"inner"), inner);
    EXPECT_EQ(builder_.addStyle(root_, u""), nullptr);
    EXPECT_EQ(builder_.addStyle(nullptr, u"x"), nullptr);
}

TEST_F(ChartBaseEdits, InsertionKeepsTheGrammarsOrder) {
    DOMElement* style = element(u"style");
    DOMElement* graph = element(u"graph");
    DOMElement* label = chart_.document()->createElementNS(root_->getNamespaceURI(), u"labelFrame");
    EXPECT_TRUE(builder_.insertBeforeSiblings(root_, label, {GrxUni::_graph}));
    EXPECT_EQ(label->getNextSibling(), graph);
    EXPECT_EQ(style->getNextSibling(), label);
    DOMElement* last = chart_.document()->createElementNS(root_->getNamespaceURI(), u"legend");
    EXPECT_TRUE(builder_.insertBeforeSiblings(root_, last, {u"popup"}));
    EXPECT_EQ(root_->getLastChild(), last);
}

// A numeric punctuation with ',' as decimal point, as a German host has.
struct CommaPoint : std::numpunct<char> {
    char do_decimal_point() const override { return ','; }
};

TEST_F(ChartBaseEdits, NumberTextIgnoresTheProcessLocale) {
    const std::string savedC = std::setlocale(LC_NUMERIC, nullptr);
    std::setlocale(LC_NUMERIC, "de_DE.UTF-8"); // may be missing; the C++ locale below is not
    const std::locale savedCpp = std::locale::global(std::locale(std::locale::classic(), new CommaPoint));
    {
        Builder builder;
        builder.setDecimalPoint(',');
        EXPECT_EQ(builder.asString(2.5), "2.5");
        EXPECT_EQ(builder.asString(0.1), "0.1");
        EXPECT_EQ(builder.asString(1234567), "1234567");
        EXPECT_EQ(builder.asDouble("2.5"), 2.5);
        EXPECT_EQ(builder.asDouble("-1e3"), -1000.0);
        EXPECT_EQ(builder.asDouble("abc"), std::numeric_limits<double>::lowest());
        EXPECT_EQ(builder.asDouble(""), std::numeric_limits<double>::lowest());
    }
    std::locale::global(savedCpp);
    std::setlocale(LC_NUMERIC, savedC.c_str());
}

TEST_F(ChartBaseEdits, TokensCountFromZero) {
    EXPECT_EQ(ChartBase::getToken(u"a;b c", u"; ", 0).toUTF8(), "a");
    EXPECT_EQ(ChartBase::getToken(u"a;b c", u"; ", 2).toUTF8(), "c");
    EXPECT_EQ(ChartBase::getToken(u"a;b c", u"; ", 3).toUTF8(), "");
    EXPECT_EQ(ChartBase::getToken(u";;x;;", u";", 0).toUTF8(), "x");
}

} // namespace

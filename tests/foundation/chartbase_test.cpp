#include "support/EngineSupport.h"

#include <grx/ChartPrinter.h>

#include <xercesc/dom/DOM.hpp>

#include <algorithm>
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
static_assert(!std::is_copy_constructible_v<Builder> && !std::is_copy_assignable_v<Builder>);

std::string utf8(const XMLCh* s) {
    return ChartString(s).toUTF8();
}

bool contains(const std::vector<std::string>& v, const std::string& s) {
    return std::find(v.begin(), v.end(), s) != v.end();
}

using ChartBaseDocuments = EngineTest;

TEST_F(ChartBaseDocuments, NewDocumentsNameTheirGrammarAndReadBack) {
    DOMDocument* d = ChartBase::createGrxDocument(ChartBase::_utf8);
    ASSERT_NE(d, nullptr);
    const DOMElement* root = d->getDocumentElement();
    EXPECT_EQ(utf8(root->getLocalName()), "visualization");
    EXPECT_EQ(utf8(root->getNamespaceURI()), "http://plotaid.org/grxml");
    EXPECT_EQ(utf8(root->getAttribute(u"xsi:schemaLocation")),
              "http://plotaid.org/grxml http://plotaid.org/grxml/grxml-2.9.xsd");
    EXPECT_EQ(utf8(d->getXmlVersion()), "1.0");
    EXPECT_FALSE(d->getXmlStandalone());
    std::ostringstream printed;
    ChartPrinter().Print(d, printed);
    EXPECT_TRUE(ChartBase::ValidXML(printed.str()));
    ChartBase::releaseDocument(d);
    ChartBase::releaseDocument(nullptr);

    d = ChartBase::createDocument(ChartBase::_utf16);
    ASSERT_NE(d, nullptr);
    EXPECT_EQ(utf8(d->getDocumentElement()->getLocalName()), "graph");
    EXPECT_EQ(utf8(d->getDocumentElement()->getAttribute(u"xsi:schemaLocation")),
              "http://plotaid.org/grxml http://plotaid.org/grxml/grxml-1.4.xsd");
    ChartBase::releaseDocument(d);
}

TEST_F(ChartBaseDocuments, BrokenChartsAreRefusedWithRecords) {
    Builder builder;
    EXPECT_NE(builder.parseDocument(engine_test::example("charts/simple-bar.xml")), nullptr);
    EXPECT_TRUE(ChartBase::ValidXML(engine_test::example("charts/histogram.xml")));
    const std::string broken = engine_test::example("charts/histogram.xml");
    const std::string bogus = broken.substr(0, broken.rfind("</visualization>")) + "<bogus/></visualization>";
    Records records;
    EXPECT_EQ(builder.parseDocument(bogus), nullptr);
    EXPECT_FALSE(ChartBase::ValidXML(bogus));
    EXPECT_FALSE(ChartBase::ValidXML(""));
    EXPECT_TRUE(contains(records.errors(), "parseDocument fatal error while parsing"));
    EXPECT_TRUE(contains(records.errors(), "XML stream validation error"));
}

class ChartBaseEdits : public EngineTest {
protected:
    void SetUp() override {
        chart_ = Chart::empty();
        builder_.setDocument(chart_.document());
        root_ = chart_.document()->getDocumentElement();
    }
    DOMElement* element(const XMLCh* name, DOMElement* parent = nullptr) {
        DOMElement* e = chart_.document()->createElementNS(root_->getNamespaceURI(), name);
        (parent ? parent : root_)->appendChild(e);
        return e;
    }
    Chart chart_;
    Builder builder_;
    DOMElement* root_ = nullptr;
};

TEST_F(ChartBaseEdits, AttributesAndIdsAreCheckedAndLogged) {
    DOMElement* first = element(u"style");
    DOMElement* second = element(u"style");
    Records records;
    EXPECT_EQ(builder_.AddAttribute(first, u"color", nullptr), -1);
    EXPECT_FALSE(first->hasAttribute(u"color"));
    EXPECT_EQ(records.errors().back(), "attribute value is empty for name color");
    EXPECT_EQ(builder_.AddAttribute(first, u"color", u""), 0);
    EXPECT_TRUE(first->hasAttribute(u"color"));
    EXPECT_EQ(ChartBase::AddAttributeDoc(chart_.document(), first, u"bad name", u"x"), -1);
    EXPECT_EQ(records.errors().back(), "attribute name does not exist bad name x");

    // A repeated id is logged, and the later element answers to it.
    EXPECT_TRUE(builder_.AddID(first, u"s1"));
    EXPECT_EQ(chart_.document()->getElementById(u"s1"), first);
    EXPECT_TRUE(builder_.AddID(second, u"s1"));
    EXPECT_EQ(chart_.document()->getElementById(u"s1"), second);
    EXPECT_EQ(records.errors().back(), "Attempting to add an existing ID to an element (s1 style)");
    EXPECT_FALSE(builder_.AddID(first, u""));
    EXPECT_EQ(records.errors().back(), "ID name attribute is empty for element style");
    EXPECT_EQ(records.errors().size(), 4u);
    // Wrapped elements keep the object model's registration too.
    GrxStyle& a = chart_.vis->addStyle();
    GrxStyle& b = chart_.vis->addStyle();
    EXPECT_TRUE(builder_.AddID(a.getImplementation(), u"dup"));
    EXPECT_TRUE(builder_.AddID(b.getImplementation(), u"dup"));
    EXPECT_EQ(chart_.vis->getStyleById(u"dup"), &b);
}

TEST_F(ChartBaseEdits, UniqueIdsTakeTheFirstFreeNumber) {
    const auto next = [this](const char* prefix) {
        return ChartBase::CreateUniqueId(prefix ? ChartString(prefix) : ChartString(), *chart_.vis).toUTF8();
    };
    chart_.vis->addStyle().setId(u"style1");
    chart_.vis->addStyle().setId(u"style2");
    EXPECT_EQ(next("style"), "style3");
    EXPECT_EQ(next("style"), "style3") << "unused, so handed out again";
    chart_.vis->addStyle().setId(u"style3");
    chart_.vis->addStyle().setId(u"style5");
    EXPECT_EQ(next("style"), "style4");
    EXPECT_EQ(next("other"), "other1");
    EXPECT_EQ(next(nullptr), "id1");

    GrxStyle* last = nullptr;
    for (int i = 0; i < 50; ++i) {
        last = &chart_.vis->addStyle();
        last->setId(ChartString(next("s")));
    }
    EXPECT_EQ(utf8(last->getId()), "s50");
    chart_.vis->removeChild(*last);
    EXPECT_EQ(next("s"), "s50") << "exact after the last one is removed";
    // A new document at another (or the same) address starts from 1.
    Chart other = Chart::empty();
    EXPECT_EQ(ChartBase::CreateUniqueId(ChartString("s"), *other.vis).toUTF8(), "s1");
}

TEST_F(ChartBaseEdits, SearchMergeAndRemove) {
    DOMElement* a = element(u"style");
    DOMElement* b = element(u"style");
    element(u"label", a);
    a->setAttribute(u"color", u"red");
    a->setAttribute(u"margin", u"2pt");
    b->setAttribute(u"color", u"red");
    EXPECT_EQ(ChartBase::getChildByTagName(root_, u"style"), a);
    EXPECT_EQ(ChartBase::getChildByTagName(root_, u"label"), nullptr) << "direct children only";
    EXPECT_EQ(ChartBase::getChildByTagName(nullptr, u"style"), nullptr);
    EXPECT_EQ(builder_.getElementWithAttribute(u"style", u"color", u"red"), a);
    EXPECT_EQ(builder_.getElementWithAttribute(u"style", u"color", u"green"), nullptr);

    b->setAttribute(u"color", u"blue");
    b->setAttribute(u"padding", u"1pt");
    EXPECT_TRUE(ChartBase::mergeAttributes(a, b));
    EXPECT_EQ(utf8(b->getAttribute(u"color")) + utf8(b->getAttribute(u"margin")) +
                  utf8(b->getAttribute(u"padding")),
              "red2pt1pt");
    EXPECT_FALSE(ChartBase::mergeAttributes(nullptr, b));
    EXPECT_FALSE(ChartBase::mergeAttributes(a, nullptr));

    a->appendChild(chart_.document()->createTextNode(u"x"));
    element(u"text", a);
    EXPECT_EQ(builder_.removeAllChildren(a), 3u) << "text counts as a child";
    EXPECT_EQ(a->getFirstChild(), nullptr);
    EXPECT_EQ(builder_.removeAllChildren(nullptr), 0u);
}

TEST_F(ChartBaseEdits, StylesAreFoundAtAnyDepthAndInsertionKeepsTheGrammarsOrder) {
    DOMElement* holder = element(u"style");
    DOMElement* inner = builder_.addStyle(holder, u"inner");
    ASSERT_NE(inner, nullptr);
    EXPECT_EQ(inner->getParentNode(), holder);
    EXPECT_EQ(builder_.addStyle(root_, u"inner"), inner);
    EXPECT_EQ(builder_.addStyle(root_, u""), nullptr);
    EXPECT_EQ(builder_.addStyle(nullptr, u"x"), nullptr);

    DOMElement* graph = element(u"graph");
    DOMElement* label = chart_.document()->createElementNS(root_->getNamespaceURI(), u"labelFrame");
    EXPECT_TRUE(builder_.insertBeforeSiblings(root_, label, {GrxUni::_graph}));
    EXPECT_EQ(label->getNextSibling(), graph);
    EXPECT_EQ(holder->getNextSibling(), label);
    DOMElement* last = chart_.document()->createElementNS(root_->getNamespaceURI(), u"legend");
    EXPECT_TRUE(builder_.insertBeforeSiblings(root_, last, {u"popup"}));
    EXPECT_EQ(root_->getLastChild(), last);
}

// A numeric punctuation with ',' as decimal point, as a German host has.
struct CommaPoint : std::numpunct<char> {
    char do_decimal_point() const override { return ','; }
};

TEST_F(ChartBaseEdits, NumbersAndTokensIgnoreTheProcessLocale) {
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

    EXPECT_EQ(ChartBase::getToken(u"a;b c", u"; ", 0).toUTF8(), "a");
    EXPECT_EQ(ChartBase::getToken(u"a;b c", u"; ", 2).toUTF8(), "c");
    EXPECT_EQ(ChartBase::getToken(u"a;b c", u"; ", 3).toUTF8(), "");
    EXPECT_EQ(ChartBase::getToken(u";;x;;", u";", 0).toUTF8(), "x");
}

} // namespace

#include "foundation/FoundationSupport.h"

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
using foundation_test::utf8;

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

using ChartBaseDocuments = EngineTest;

TEST_F(ChartBaseDocuments, NewDocumentsNameTheirGrammarAndBrokenChartsAreRefused) {
    const std::string ns = "http://plotaid.org/grxml";
    for (auto [d, root, grammar] :
         {std::tuple(ChartBase::createGrxDocument(ChartBase::_utf8), "visualization", "2.9"),
          std::tuple(ChartBase::createDocument(ChartBase::_utf16), "graph", "1.4")}) {
        ASSERT_NE(d, nullptr);
        const DOMElement* e = d->getDocumentElement();
        EXPECT_EQ(utf8(e->getLocalName()) + " " + utf8(e->getAttribute(u"xsi:schemaLocation")),
                  std::string(root) + " " + ns + " " + ns + "/grxml-" + grammar + ".xsd");
        EXPECT_EQ(utf8(e->getNamespaceURI()) + " " + utf8(d->getXmlVersion()) +
                      (d->getXmlStandalone() ? "!" : ""),
                  ns + " 1.0");
        std::ostringstream printed;
        ChartPrinter().Print(d, printed);
        EXPECT_TRUE(ChartBase::ValidXML(printed.str()) || std::string(root) == "graph");
        ChartBase::releaseDocument(d);
    }
    ChartBase::releaseDocument(nullptr);
    Builder builder;
    EXPECT_NE(builder.parseDocument(engine_test::example("charts/simple-bar.xml")), nullptr);
    const std::string good = engine_test::example("charts/histogram.xml");
    EXPECT_TRUE(ChartBase::ValidXML(good));
    const std::string bogus = good.substr(0, good.rfind("</visualization>")) + "<bogus/></visualization>";
    Records records;
    EXPECT_EQ(builder.parseDocument(bogus), nullptr);
    EXPECT_FALSE(ChartBase::ValidXML(bogus) || ChartBase::ValidXML(""));
    std::string all = "|";
    for (const std::string& e : records.errors())
        all += e + "|";
    EXPECT_NE(all.find("|parseDocument fatal error while parsing|"), std::string::npos) << all;
    EXPECT_NE(all.find("|XML stream validation error|"), std::string::npos) << all;
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
    EXPECT_EQ(builder_.AddAttribute(first, u"color", u""), 0);
    EXPECT_TRUE(first->hasAttribute(u"color"));
    EXPECT_EQ(ChartBase::AddAttributeDoc(chart_.document(), first, u"bad name", u"x"), -1);

    // A repeated id is logged, and the later element answers to it.
    EXPECT_TRUE(builder_.AddID(first, u"s1"));
    EXPECT_EQ(chart_.document()->getElementById(u"s1"), first);
    EXPECT_TRUE(builder_.AddID(second, u"s1"));
    EXPECT_EQ(chart_.document()->getElementById(u"s1"), second);
    EXPECT_FALSE(builder_.AddID(first, u""));
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
    for (const char16_t* id : {u"style1", u"style2"})
        chart_.vis->addStyle().setId(id);
    EXPECT_EQ(next("style"), "style3");
    EXPECT_EQ(next("style"), "style3") << "unused, so handed out again";
    for (const char16_t* id : {u"style3", u"style5"})
        chart_.vis->addStyle().setId(id);
    EXPECT_EQ(next("style") + next("other") + next(nullptr), "style4other1id1");

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

TEST_F(ChartBaseEdits, SearchMergeRemoveAndInsert) {
    DOMElement* a = element(u"style");
    DOMElement* b = element(u"style");
    element(u"label", a);
    a->setAttribute(u"color", u"red");
    a->setAttribute(u"margin", u"2pt");
    b->setAttribute(u"color", u"red");
    EXPECT_EQ(ChartBase::getChildByTagName(root_, u"style"), a);
    EXPECT_EQ(ChartBase::getChildByTagName(root_, u"label"), nullptr) << "direct children only";
    EXPECT_EQ(builder_.getElementWithAttribute(u"style", u"color", u"red"), a);
    EXPECT_EQ(builder_.getElementWithAttribute(u"style", u"color", u"green"), nullptr);

    b->setAttribute(u"color", u"blue");
    b->setAttribute(u"padding", u"1pt");
    EXPECT_TRUE(ChartBase::mergeAttributes(a, b));
    EXPECT_EQ(utf8(b->getAttribute(u"color")) + utf8(b->getAttribute(u"margin")) +
                  utf8(b->getAttribute(u"padding")),
              "red2pt1pt");
    EXPECT_FALSE(ChartBase::mergeAttributes(nullptr, b));

    a->appendChild(chart_.document()->createTextNode(u"x"));
    element(u"text", a);
    EXPECT_EQ(builder_.removeAllChildren(a), 3u) << "text counts as a child";
    EXPECT_EQ(a->getFirstChild(), nullptr);
    EXPECT_TRUE(!ChartBase::getChildByTagName(nullptr, u"style") && !builder_.removeAllChildren(nullptr) &&
                !builder_.addStyle(nullptr, u"x") && !ChartBase::mergeAttributes(a, nullptr));

    // Styles are found at any depth; insertion keeps the grammar's order.
    DOMElement* holder = b;
    DOMElement* inner = builder_.addStyle(holder, u"inner");
    ASSERT_NE(inner, nullptr);
    EXPECT_EQ(inner->getParentNode(), holder);
    EXPECT_EQ(builder_.addStyle(root_, u"inner"), inner);
    EXPECT_EQ(builder_.addStyle(root_, u""), nullptr);

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
        EXPECT_EQ(builder.asString(2.5) + " " + builder.asString(0.1) + " " + builder.asString(1234567),
                  "2.5 0.1 1234567");
        EXPECT_EQ(builder.asDouble("2.5"), 2.5);
        EXPECT_EQ(builder.asDouble("-1e3"), -1000.0);
        EXPECT_EQ(builder.asDouble("abc"), std::numeric_limits<double>::lowest());
    }
    std::locale::global(savedCpp);
    std::setlocale(LC_NUMERIC, savedC.c_str());

    std::string tokens;
    for (int i : {0, 2, 3})
        tokens += ChartBase::getToken(u"a;b c", u"; ", i).toUTF8() + "|";
    EXPECT_EQ(tokens + ChartBase::getToken(u";;x;;", u";", 0).toUTF8(), "a|c||x");
}

} // namespace

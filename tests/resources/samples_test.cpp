// The sample charts are the test bed of the whole library: each must be complete (titles,
// footnotes, legend, axes with ticks and labels, styles by id, data), and every reference in it
// must lead to an element of the right kind.
#include "support/GrammarSupport.h"

#include "foundation/ValidatingParser.h"

#include <grx/ChartString.h>

#include <xercesc/dom/DOMAttr.hpp>
#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMElement.hpp>
#include <xercesc/dom/DOMNamedNodeMap.hpp>
#include <xercesc/dom/DOMNodeList.hpp>

#include <gtest/gtest.h>

#include <algorithm>

using namespace grammar_test;
using namespace XERCES_CPP_NAMESPACE;

namespace {

std::string utf8(const XMLCh* text) {
    return ChartString(text).toUTF8();
}

std::vector<const DOMElement*> all(const DOMNode& under, const char* tag) {
    const DOMNodeList* list =
        under.getNodeType() == DOMNode::DOCUMENT_NODE
            ? static_cast<const DOMDocument&>(under).getElementsByTagNameNS(u"*", ChartString(tag).xc_str())
            : static_cast<const DOMElement&>(under).getElementsByTagNameNS(u"*", ChartString(tag).xc_str());
    std::vector<const DOMElement*> out;
    for (XMLSize_t i = 0; i < list->getLength(); ++i)
        out.push_back(static_cast<const DOMElement*>(list->item(i)));
    return out;
}

std::string tagOf(const DOMElement* e) {
    return e ? utf8(e->getLocalName()) : std::string("(none)");
}

std::size_t fieldCount(const DOMElement* e) {
    const std::string row = utf8(e->getTextContent());
    return std::count(row.begin(), row.end(), ';') + 1;
}

bool listed(const std::string& words, const std::string& word) {
    return (" " + words + " ").find(" " + word + " ") != std::string::npos;
}

// Attributes that hold the id of another element, and the kinds that element may be.
const std::pair<const char*, const char*> kReferences[] = {
    {"style cellStyle markStyle tickFrameStyle tickTextStyle textFrameStyle hingeStyle medianStyle "
     "fenceStyle outlierStyle extremeStyle",
     "style"},
    {"cycle styleCycleRepository", "styleCycle"},
    {"coordinates", "coordinates"},
    {"variable clusterVariable", "sourceVariable expressionVariable derivedVariable"},
    {"domain", "categoricalDomain intervalDomain"},
    {"categoricalDomain", "categoricalDomain"},
    {"source", "embeddedSource userSource databaseSource delimitedFileSource streamingSource"},
    {"title1 footnote1", "labelFrame"},
    {"legend1", "legend"},
};

TEST(SampleCharts, AreCompleteAndEveryReferenceResolves) {
    useSourceGrammars();
    plotaid::detail::ValidatingParser parser;
    const std::vector<std::string> charts = sampleCharts();
    ASSERT_EQ(charts.size(), 16u);
    for (const std::string& chart : charts) {
        SCOPED_TRACE(chart);
        const DOMDocument* document =
            parser.parse(readText(chart), chart.c_str(), ChartException("sample chart", "tests/grammar", 0));
        ASSERT_NE(document, nullptr);
        ASSERT_EQ(all(*document, "extension").size(), 1u);
        for (const char* slot : {"title1", "footnote1", "legend1"})
            EXPECT_TRUE(all(*document, "extension")[0]->hasAttribute(ChartString(slot).xc_str())) << slot;
        EXPECT_FALSE(all(*document, "legendTarget").empty());
        EXPECT_NE(document->getElementById(u"c-o-n-t-a-i-n-er"), nullptr);
        EXPECT_FALSE(all(*document, "axis").empty() || all(*document, "dimension").empty());
        for (const DOMElement* axis : all(*document, "axis"))
            EXPECT_FALSE(all(*axis, "majorTicks").empty());
        for (const DOMElement* dimension : all(*document, "dimension"))
            EXPECT_FALSE(all(*dimension, "label").empty());

        // Every reference leads to an element of a kind that fits; a style's own attributes other
        // than "style" are values, and the extension's slots other than the frames are open.
        std::size_t resolved = 0;
        for (const DOMElement* element : all(*document, "*")) {
            const DOMNamedNodeMap* attributes = element->getAttributes();
            for (XMLSize_t i = 0; i < attributes->getLength(); ++i) {
                const auto* a = static_cast<const DOMAttr*>(attributes->item(i));
                const std::string name = utf8(a->getName());
                const auto row = std::find_if(std::begin(kReferences), std::end(kReferences),
                                              [&](const auto& r) { return listed(r.first, name); });
                const bool frameSlot = row - std::begin(kReferences) >= 7;
                if (row == std::end(kReferences) || (tagOf(element) == "style" && name != "style") ||
                    (tagOf(element) == "extension") != frameSlot)
                    continue;
                const DOMElement* target = document->getElementById(a->getValue());
                EXPECT_TRUE(target && listed(row->second, tagOf(target)))
                    << tagOf(element) << " " << name << "=\"" << utf8(a->getValue()) << "\" leads to "
                    << tagOf(target);
                ++resolved;
            }
        }
        EXPECT_GT(resolved, 20u);

        // The data: every row has one field per variable name.
        ASSERT_FALSE(all(*document, "embeddedSource").empty());
        for (const DOMElement* source : all(*document, "embeddedSource")) {
            ASSERT_FALSE(all(*source, "row").empty());
            for (const DOMElement* row : all(*source, "row"))
                EXPECT_EQ(fieldCount(row), fieldCount(all(*source, "names").at(0)));
        }
    }
}

} // namespace

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

std::u16string wide(const std::string& ascii) {
    return std::u16string(ascii.begin(), ascii.end());
}

std::vector<const DOMElement*> all(const DOMDocument& document, const std::string& tag) {
    const DOMNodeList* list = document.getElementsByTagNameNS(u"http://plotaid.org/grxml", wide(tag).c_str());
    std::vector<const DOMElement*> out;
    for (XMLSize_t i = 0; i < list->getLength(); ++i)
        out.push_back(static_cast<const DOMElement*>(list->item(i)));
    return out;
}

std::string attr(const DOMElement* e, const char* name) {
    return utf8(e->getAttribute(wide(name).c_str()));
}

std::string tagOf(const DOMElement* e) {
    return e ? utf8(e->getLocalName()) : std::string("(none)");
}

std::size_t fieldCount(const std::string& row) {
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
};

// The kinds an attribute may lead to; null when it is no reference.
const char* referenceKinds(const std::string& attribute) {
    for (const auto& [attributes, kinds] : kReferences)
        if (listed(attributes, attribute))
            return kinds;
    return nullptr;
}

class SampleCharts : public ::testing::Test {
protected:
    static void SetUpTestSuite() { useSourceGrammars(); }
    plotaid::detail::ValidatingParser parser;
};

TEST_F(SampleCharts, AreCompleteAndEveryReferenceResolves) {
    const std::vector<std::string> charts = sampleCharts();
    ASSERT_EQ(charts.size(), 15u);
    for (const std::string& chart : charts) {
        SCOPED_TRACE(chart);
        const DOMDocument* document =
            parser.parse(readText(chart), chart.c_str(), ChartException("sample chart", "tests/grammar", 0));
        ASSERT_NE(document, nullptr);

        const std::vector<const DOMElement*> extensions = all(*document, "extension");
        ASSERT_EQ(extensions.size(), 1u);
        for (const auto& [slot, kind] : {std::pair<const char*, const char*>{"title1", "labelFrame"},
                                         {"footnote1", "labelFrame"},
                                         {"legend1", "legend"}})
            EXPECT_EQ(tagOf(document->getElementById(wide(attr(extensions[0], slot)).c_str())), kind) << slot;
        EXPECT_FALSE(all(*document, "legendTarget").empty());
        EXPECT_NE(document->getElementById(u"c-o-n-t-a-i-n-er"), nullptr);

        const std::vector<const DOMElement*> axes = all(*document, "axis");
        EXPECT_GE(axes.size(), 1u);
        for (const DOMElement* axis : axes)
            EXPECT_TRUE(axis->getElementsByTagNameNS(u"*", u"majorTicks")->getLength() > 0)
                << attr(axis, "id");
        EXPECT_GE(all(*document, "dimension").size(), 1u);
        for (const DOMElement* dimension : all(*document, "dimension")) {
            const DOMNodeList* labels = dimension->getElementsByTagNameNS(u"*", u"label");
            ASSERT_GT(labels->getLength(), 0u) << attr(dimension, "id");
        }

        // every reference leads to an element of a kind that fits
        std::size_t resolved = 0;
        for (const DOMElement* element : all(*document, "*")) {
            if (tagOf(element) == "extension")
                continue; // its frame slots are checked above; other attributes are open
            const DOMNamedNodeMap* attributes = element->getAttributes();
            for (XMLSize_t i = 0; i < attributes->getLength(); ++i) {
                const auto* a = static_cast<const DOMAttr*>(attributes->item(i));
                const char* kinds = referenceKinds(utf8(a->getName()));
                if (kinds == nullptr || (tagOf(element) == "style" && utf8(a->getName()) != "style"))
                    continue;
                const DOMElement* target = document->getElementById(a->getValue());
                EXPECT_TRUE(target && listed(kinds, tagOf(target)))
                    << tagOf(element) << " " << attr(element, "id") << ": " << utf8(a->getName()) << "=\""
                    << utf8(a->getValue()) << "\" leads to " << tagOf(target);
                ++resolved;
            }
        }
        EXPECT_GT(resolved, 20u);

        // the data: every row has one field per variable name
        const std::vector<const DOMElement*> sources = all(*document, "embeddedSource");
        ASSERT_FALSE(sources.empty());
        for (const DOMElement* source : sources) {
            const std::size_t names =
                fieldCount(utf8(source->getElementsByTagNameNS(u"*", u"names")->item(0)->getTextContent()));
            const DOMNodeList* rows = source->getElementsByTagNameNS(u"*", u"row");
            ASSERT_GT(rows->getLength(), 0u);
            for (XMLSize_t r = 0; r < rows->getLength(); ++r)
                EXPECT_EQ(fieldCount(utf8(rows->item(r)->getTextContent())), names) << "row " << r;
        }
    }
}

} // namespace

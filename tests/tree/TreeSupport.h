#ifndef PLOTAID_TESTS_TREE_TREESUPPORT_H
#define PLOTAID_TESTS_TREE_TREESUPPORT_H

#include "foundation/ValidatingParser.h"
#include "support/EngineSupport.h"
#include "support/GrammarSupport.h"

#include <plotaid/TreeTransformer.h>

#include <grx/ChartString.h>

#include <xercesc/dom/DOM.hpp>

#include <gtest/gtest.h>

#include <string>
#include <vector>

// Opens the protected operations for the tests.
class TestTree : public TreeTransformer {
public:
    using TreeTransformer::compressDocument;
    using TreeTransformer::createPMMLDocument;
    using TreeTransformer::displayDocument;
    using TreeTransformer::GetNewPredictorItem;
    using TreeTransformer::GetStatFormatElement;
    using TreeTransformer::SetupDisplayData;
    using TreeTransformer::setupPMMLDOM;
    using TreeTransformer::TreeTransformer;
    XERCES_CPP_NAMESPACE::DOMDocument* pmmlDocument() const { return document_; }
};

inline std::string example(const std::string& name) {
    return readAll(std::string(PLOTAID_EXAMPLES_DIR) + "/pmml/" + name);
}

inline std::string u8(const XMLCh* text) {
    return text ? ChartString(text).toUTF8() : std::string("<null>");
}

// Elements of the local name anywhere below the node, in document order.
inline std::vector<XERCES_CPP_NAMESPACE::DOMElement*> elements(const XERCES_CPP_NAMESPACE::DOMNode* node,
                                                               const char* name) {
    std::vector<XERCES_CPP_NAMESPACE::DOMElement*> found;
    for (auto* child = node ? node->getFirstChild() : nullptr; child; child = child->getNextSibling()) {
        if (child->getNodeType() != XERCES_CPP_NAMESPACE::DOMNode::ELEMENT_NODE)
            continue;
        auto* element = static_cast<XERCES_CPP_NAMESPACE::DOMElement*>(child);
        if (u8(element->getLocalName()) == name)
            found.push_back(element);
        for (auto* below : elements(element, name))
            found.push_back(below);
    }
    return found;
}

inline std::string attr(const XERCES_CPP_NAMESPACE::DOMElement* element, const char* name) {
    if (element == nullptr)
        return "<no element>";
    const std::u16string key(name, name + std::char_traits<char>::length(name));
    return element->hasAttribute(key.c_str()) ? u8(element->getAttribute(key.c_str())) : "<absent>";
}

// One attribute of every element of the local name below the node.
inline std::vector<std::string> values(const XERCES_CPP_NAMESPACE::DOMNode* under, const char* name,
                                       const char* attribute) {
    std::vector<std::string> out;
    for (const auto* e : elements(under, name))
        out.push_back(attr(e, attribute));
    return out;
}

// Texts the library wrote, read back with validation against their grammars.
class Reader {
public:
    XERCES_CPP_NAMESPACE::DOMDocument* read(const std::string& text) {
        return parser_.parse(text, "test", ChartException("test parse", "test", 1));
    }
    const std::vector<std::string>& errors() const { return parser_.lastErrors(); }

private:
    plotaid::detail::ValidatingParser parser_;
};

// Whether one of the error messages reported while it lives contains the text.
inline bool mentions(const engine_test::Records& records, const std::string& part) {
    for (const std::string& message : records.errors())
        if (message.find(part) != std::string::npos)
            return true;
    return false;
}

#endif

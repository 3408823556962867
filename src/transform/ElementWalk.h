#ifndef PLOTAID_TRANSFORM_ELEMENTWALK_H
#define PLOTAID_TRANSFORM_ELEMENTWALK_H

// Walks over the elements below a node in document order, without recursion, so that a deeply
// nested document costs no stack.

#include <xercesc/dom/DOMElement.hpp>
#include <xercesc/util/XMLString.hpp>

namespace plotaid::detail {

// Names of the older chart form that the object model does not know.
constexpr XMLCh kFacetVariable[] = u"facetvariable";
constexpr XMLCh kStyleBy[] = u"styleby";

inline bool isNamed(const XERCES_CPP_NAMESPACE::DOMNode* node, const XMLCh* tag) {
    return node != nullptr && node->getNodeType() == XERCES_CPP_NAMESPACE::DOMNode::ELEMENT_NODE &&
           XERCES_CPP_NAMESPACE::XMLString::equals(node->getNodeName(), tag);
}

inline bool isEmpty(const XMLCh* text) {
    return text == nullptr || *text == 0;
}

// The element after `at` in document order among the descendants of `root`; null past the last.
inline XERCES_CPP_NAMESPACE::DOMElement* nextElement(const XERCES_CPP_NAMESPACE::DOMNode* root,
                                                     const XERCES_CPP_NAMESPACE::DOMNode* at) {
    using XERCES_CPP_NAMESPACE::DOMNode;
    const DOMNode* node = at;
    for (;;) {
        const DOMNode* next = node->getFirstChild();
        while (next == nullptr && node != root) {
            next = node->getNextSibling();
            if (next == nullptr)
                node = node->getParentNode();
            if (node == nullptr)
                return nullptr;
        }
        if (next == nullptr)
            return nullptr;
        if (next->getNodeType() == DOMNode::ELEMENT_NODE)
            return static_cast<XERCES_CPP_NAMESPACE::DOMElement*>(const_cast<DOMNode*>(next));
        node = next;
    }
}

// Calls visit(element) for each descendant element of root named tag (every element for a null
// tag), in document order, until visit returns false.
template <class Visit>
void forEachDescendant(const XERCES_CPP_NAMESPACE::DOMNode* root, const XMLCh* tag, Visit visit) {
    if (root == nullptr)
        return;
    for (XERCES_CPP_NAMESPACE::DOMElement* e = nextElement(root, root); e != nullptr; e = nextElement(root, e))
        if ((tag == nullptr || isNamed(e, tag)) && !visit(e))
            return;
}

inline XERCES_CPP_NAMESPACE::DOMElement* firstDescendant(const XERCES_CPP_NAMESPACE::DOMNode* root,
                                                         const XMLCh* tag) {
    XERCES_CPP_NAMESPACE::DOMElement* found = nullptr;
    forEachDescendant(root, tag, [&](XERCES_CPP_NAMESPACE::DOMElement* e) {
        found = e;
        return false;
    });
    return found;
}

// The first descendant named tag whose attribute equals value.
inline XERCES_CPP_NAMESPACE::DOMElement* descendantWith(const XERCES_CPP_NAMESPACE::DOMNode* root,
                                                        const XMLCh* tag, const XMLCh* attribute,
                                                        const XMLCh* value) {
    XERCES_CPP_NAMESPACE::DOMElement* found = nullptr;
    forEachDescendant(root, tag, [&](XERCES_CPP_NAMESPACE::DOMElement* e) {
        if (XERCES_CPP_NAMESPACE::XMLString::equals(e->getAttribute(attribute), value))
            found = e;
        return found == nullptr;
    });
    return found;
}

} // namespace plotaid::detail

#endif

#ifndef GRX_DETAIL_NAMES_H
#define GRX_DETAIL_NAMES_H

#include <xercesc/dom/DOMNode.hpp>

namespace grx::detail {

// The name an element is known by: its local name, or the node name of a DOM level 1 node.
inline const XMLCh* nameOf(const xercesc::DOMNode* node) {
    const XMLCh* local = node->getLocalName();
    return local ? local : node->getNodeName();
}

inline bool sameText(const XMLCh* a, const XMLCh* b) {
    if (a == b)
        return true;
    if (!a || !b)
        return (!a || !*a) && (!b || !*b);
    for (; *a && *a == *b; ++a, ++b) {
    }
    return *a == *b;
}

} // namespace grx::detail

#endif

#include <grx/GrxBaseElement.h>
#include <grx/GrxModel.h>
#include <grx/formatter.h>

#include "Names.h"

#include <xercesc/dom/DOMAttr.hpp>
#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMException.hpp>
#include <xercesc/dom/DOMNamedNodeMap.hpp>
#include <xercesc/dom/DOMText.hpp>
#include <xercesc/util/XMLUniDefs.hpp>

#include <cmath>

using namespace xercesc;
using grx::detail::nameOf;
using grx::detail::sameText;

namespace {

constexpr XMLCh kEmpty[] = u"";
constexpr XMLCh kXmlnsUri[] = u"http://www.w3.org/2000/xmlns/";

// Declares the element's "id" a DOM ID, so the document's id map answers for it. With a duplicate
// id the element declared last answers (the id map alone would keep answering with the first).
void declareId(DOMElement* e) {
    DOMAttr* a = e->getAttributeNode(GrxUni::_id);
    if (!a || a->isId())
        return;
    if (DOMElement* earlier = e->getOwnerDocument()->getElementById(a->getValue()); earlier && earlier != e)
        earlier->setIdAttributeNode(earlier->getAttributeNode(GrxUni::_id), false);
    e->setIdAttributeNode(a, true);
}

// A detached subtree must stop answering getElementById.
void forgetIds(DOMElement* top) {
    std::vector<DOMElement*> pending{top};
    while (!pending.empty()) {
        DOMElement* e = pending.back();
        pending.pop_back();
        DOMAttr* a = e->getAttributeNode(GrxUni::_id);
        if (a && a->isId())
            e->setIdAttributeNode(a, false);
        for (DOMElement* c = e->getFirstElementChild(); c; c = c->getNextElementSibling())
            pending.push_back(c);
    }
}

bool isAttached(const DOMNode* node) {
    const DOMDocument* doc = node->getOwnerDocument();
    for (const DOMNode* n = node; n; n = n->getParentNode())
        if (n == doc)
            return true;
    return false;
}

} // namespace

GrxBaseElement::GrxBaseElement(Key, DOMElement* element, GrxDocument* document)
    : element_(element), document_(document) {
    element_->setUserData(nameOf(element_), this, nullptr);
}

// The DOM may already be gone when wrappers die, so nothing here touches it.
GrxBaseElement::~GrxBaseElement() = default;

GrxVisualization* GrxBaseElement::getVisualization() const {
    return dynamic_cast<GrxVisualization*>(document_);
}

DOMElement* GrxBaseElement::getElementById(const XMLCh* id) const {
    if (!id || !*id)
        return nullptr;
    DOMElement* e = element_->getOwnerDocument()->getElementById(id);
    return (e && isAttached(e)) ? e : nullptr;
}

GrxStyle* GrxBaseElement::getStyleById(const XMLCh* id) const {
    return wrapperOf<GrxStyle>(getElementById(id));
}

// A missing name names no attribute: it reads as absent, and writing it is a DOM fault.
bool GrxBaseElement::isAttributePresent(const XMLCh* name) const {
    return name && *name && element_->getAttributeNode(name) != nullptr;
}

const XMLCh* GrxBaseElement::GetAttribute(const XMLCh* name) const {
    const XMLCh* v = (name && *name) ? element_->getAttribute(name) : nullptr;
    return v ? v : kEmpty;
}

void GrxBaseElement::SetAttribute(const XMLCh* name, const XMLCh* value) {
    if (!name || !*name)
        throw DOMException(DOMException::INVALID_CHARACTER_ERR);
    element_->setAttribute(name, value ? value : kEmpty);
    if (sameText(name, GrxUni::_id))
        declareId(element_);
}

void GrxBaseElement::removeAttribute(const XMLCh* name) {
    DOMAttr* a = (name && *name) ? element_->getAttributeNode(name) : nullptr;
    if (!a)
        return;
    if (a->isId())
        element_->setIdAttributeNode(a, false);
    // Not released: a caller may still hold the node; the document frees it at the end.
    element_->removeAttributeNode(a);
}

void GrxBaseElement::importAttributes(const DOMElement* from) {
    if (!from)
        return;
    const DOMNamedNodeMap* attrs = from->getAttributes();
    for (XMLSize_t i = 0, n = attrs->getLength(); i < n; ++i) {
        const DOMNode* a = attrs->item(i);
        const XMLCh* uri = a->getNamespaceURI();
        if (sameText(uri, kXmlnsUri))
            continue; // namespace declarations belong to the source document
        if (uri && *uri)
            element_->setAttributeNS(uri, a->getNodeName(), a->getNodeValue());
        else
            element_->setAttribute(a->getNodeName(), a->getNodeValue());
    }
    declareId(element_);
}

const XMLCh* GrxBaseElement::getId() const {
    return GetAttribute(GrxUni::_id);
}
void GrxBaseElement::setId(const XMLCh* id) {
    SetAttribute(GrxUni::_id, id);
}
bool GrxBaseElement::isIdPresent() const {
    return isAttributePresent(GrxUni::_id);
}

ChartString GrxBaseElement::getTextContent() const {
    std::u16string text;
    for (DOMNode* n = element_->getFirstChild(); n; n = n->getNextSibling())
        if (n->getNodeType() == DOMNode::TEXT_NODE || n->getNodeType() == DOMNode::CDATA_SECTION_NODE)
            text += n->getNodeValue();
    return ChartString(std::move(text));
}

void GrxBaseElement::setTextContent(const XMLCh* text) {
    for (DOMNode* n = element_->getFirstChild(); n;) {
        DOMNode* next = n->getNextSibling();
        if (n->getNodeType() == DOMNode::TEXT_NODE || n->getNodeType() == DOMNode::CDATA_SECTION_NODE)
            element_->removeChild(n);
        n = next;
    }
    if (text && *text)
        element_->appendChild(element_->getOwnerDocument()->createTextNode(text));
}

bool GrxBaseElement::getBool(const XMLCh* name, bool absent) const {
    const XMLCh* v = GetAttribute(name);
    if (sameText(v, GrxUni::_true) || sameText(v, u"1"))
        return true;
    if (sameText(v, GrxUni::_false) || sameText(v, u"0"))
        return false;
    return absent;
}

void GrxBaseElement::setBool(const XMLCh* name, bool value) {
    SetAttribute(name, value ? GrxUni::_true : GrxUni::_false);
}

int GrxBaseElement::getInt(const XMLCh* name, int absent) const {
    const ChartString v(GetAttribute(name));
    std::size_t i = 0;
    const std::u16string& s = v.str();
    while (i < s.size() && (s[i] == u' ' || s[i] == u'\t'))
        ++i;
    if (i < s.size() && (s[i] == u'-' || s[i] == u'+'))
        ++i;
    if (i >= s.size() || s[i] < u'0' || s[i] > u'9')
        return absent;
    return v.convertToSignedInteger();
}

void GrxBaseElement::setInt(const XMLCh* name, int value) {
    ChartString v;
    v.appendInteger(value);
    SetAttribute(name, v.xc_str());
}

double GrxBaseElement::getDouble(const XMLCh* name, double absent) const {
    const XMLCh* v = GetAttribute(name);
    if (sameText(v, u"INF"))
        return HUGE_VAL;
    if (sameText(v, u"-INF"))
        return -HUGE_VAL;
    const ChartString text(v);
    return text.isNumber() ? text.convertToDouble() : absent;
}

void GrxBaseElement::setDouble(const XMLCh* name, double value) {
    // The schema's spellings for the values a decimal cannot write.
    if (std::isnan(value))
        SetAttribute(name, u"NaN");
    else if (std::isinf(value))
        SetAttribute(name, value > 0 ? u"INF" : u"-INF");
    else
        SetAttribute(name, ChartString(formatter::AsString(value, 0)).xc_str());
}

int GrxBaseElement::getEnum(const XMLCh* name, const grx::EnumWord* table, std::size_t count,
                            int absent) const {
    const XMLCh* v = GetAttribute(name);
    if (!*v)
        return absent;
    for (std::size_t i = 0; i < count; ++i)
        if (sameText(v, table[i].word))
            return table[i].value;
    return getInt(name, absent);
}

void GrxBaseElement::setEnum(const XMLCh* name, const grx::EnumWord* table, std::size_t count, int value) {
    for (std::size_t i = 0; i < count; ++i)
        if (table[i].value == value) {
            SetAttribute(name, table[i].word);
            return;
        }
    setInt(name, value);
}

GrxBaseElement* GrxBaseElement::referenced(const XMLCh* name) const {
    return wrapperOf(getElementById(GetAttribute(name)));
}

void GrxBaseElement::setReference(const XMLCh* name, GrxBaseElement& target) {
    if (!*target.getId()) {
        // The first free "<element name><n>" id of the document.
        const ChartString base(nameOf(target.getImplementation()));
        for (unsigned n = 1;; ++n) {
            ChartString candidate(base);
            candidate.appendInteger(n);
            if (!target.doesIdExist(candidate)) {
                target.setId(candidate);
                break;
            }
        }
    }
    SetAttribute(name, target.getId());
}

std::vector<GrxBaseElement*> GrxBaseElement::childrenNamed(const XMLCh* name) const {
    std::vector<GrxBaseElement*> out;
    for (DOMElement* c = element_->getFirstElementChild(); c; c = c->getNextElementSibling()) {
        if (!sameText(nameOf(c), name))
            continue;
        GrxBaseElement* w = wrapperOf(c);
        if (!w)
            w = document_->wrap(c); // made by raw DOM calls and not wrapped yet
        if (w)
            out.push_back(w);
    }
    return out;
}

GrxBaseElement* GrxBaseElement::firstChildNamed(const XMLCh* name) const {
    for (DOMElement* c = element_->getFirstElementChild(); c; c = c->getNextElementSibling()) {
        if (!sameText(nameOf(c), name))
            continue;
        if (GrxBaseElement* w = wrapperOf(c))
            return w;
        if (GrxBaseElement* w = document_->wrap(c))
            return w;
    }
    return nullptr;
}

GrxBaseElement& GrxBaseElement::appendChild(const XMLCh* name) {
    DOMElement* child = element_->getOwnerDocument()->createElementNS(element_->getNamespaceURI(), name);
    element_->appendChild(child);
    GrxBaseElement* w = document_->wrap(child);
    if (!w) {
        // Unknown names are never asked for by the typed classes; keep the DOM as it was.
        element_->removeChild(child);
        throw DOMException(DOMException::NOT_SUPPORTED_ERR);
    }
    return *w;
}

void GrxBaseElement::removeChildrenNamed(const XMLCh* name) {
    for (DOMElement* c = element_->getFirstElementChild(); c;) {
        DOMElement* next = c->getNextElementSibling();
        if (sameText(nameOf(c), name)) {
            forgetIds(c);
            element_->removeChild(c);
        }
        c = next;
    }
}

void GrxBaseElement::removeChild(GrxBaseElement& child) {
    DOMElement* c = child.getImplementation();
    if (c->getParentNode() != element_)
        return;
    forgetIds(c);
    element_->removeChild(c);
}

GrxBaseElement* GrxBaseElement::wrapperOf(const DOMNode* node) {
    if (!node || node->getNodeType() != DOMNode::ELEMENT_NODE)
        return nullptr;
    return static_cast<GrxBaseElement*>(node->getUserData(nameOf(node)));
}

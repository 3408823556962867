#ifndef PLOTAID_CHARTELEMENT_H
#define PLOTAID_CHARTELEMENT_H

#include <plotaid/Export.h>

#include <xercesc/util/XercesDefs.hpp>

XERCES_CPP_NAMESPACE_BEGIN
class DOMElement;
class DOMNode;
XERCES_CPP_NAMESPACE_END

// A view of one element of an older chart document or earlier-form template, answering questions in
// the chart grammar's terms. It owns nothing and is copied by value; an empty wrapper (no element)
// answers null, false or another empty wrapper. Texts it returns belong to the document.
class PLOTAID_API ChartElement {
public:
    ChartElement() = default;
    explicit ChartElement(XERCES_CPP_NAMESPACE::DOMElement* element);
    // A node that is not an element gives an empty wrapper.
    explicit ChartElement(XERCES_CPP_NAMESPACE::DOMNode* node);
    ChartElement(const ChartElement&) = default;
    ChartElement& operator=(const ChartElement&) = default;
    virtual ~ChartElement();

    virtual XERCES_CPP_NAMESPACE::DOMElement* get() const;
    virtual const XMLCh* getType() const;
    virtual const XMLCh* getStyle() const;
    virtual const XMLCh* getName() const;
    // The document's root element.
    virtual XERCES_CPP_NAMESPACE::DOMElement* getGraph() const;
    // Null also when the parent is not an element (the document).
    virtual XERCES_CPP_NAMESPACE::DOMElement* getParent() const;
    // Only the exact word "true" counts.
    virtual bool isCategorical() const;
    virtual XERCES_CPP_NAMESPACE::DOMElement* getChildWithAttribute(const XMLCh* attribute,
                                                                    const XMLCh* value) const;
    // The first descendant in document order named tag whose attribute equals value.
    virtual XERCES_CPP_NAMESPACE::DOMElement* getOffspringWithAttribute(const XMLCh* tag, const XMLCh* attribute,
                                                                        const XMLCh* value) const;
    // As getOffspringWithAttribute, over the whole document.
    virtual XERCES_CPP_NAMESPACE::DOMElement* getElementWithAttribute(const XMLCh* tag, const XMLCh* attribute,
                                                                      const XMLCh* value) const;
    virtual XERCES_CPP_NAMESPACE::DOMElement* getFirstElementByTagName(const XMLCh* tag) const;
    virtual XERCES_CPP_NAMESPACE::DOMElement* getFirstChildByTagName(const XMLCh* tag) const;
    virtual void set(XERCES_CPP_NAMESPACE::DOMNode* node);
    virtual void set(XERCES_CPP_NAMESPACE::DOMElement* element);
    virtual bool isNull() const;
    // Empty when the attribute is absent; null for an empty wrapper.
    virtual const XMLCh* getAttributeValue(const XMLCh* name) const;

protected:
    XERCES_CPP_NAMESPACE::DOMElement* element_ = nullptr;
};

#endif

#ifndef GRX_GRXBASEELEMENT_H
#define GRX_GRXBASEELEMENT_H

#include <grx/ChartString.h>
#include <grx/Export.h>

#include <xercesc/dom/DOMElement.hpp>

#include <cstddef>
#include <vector>

class GrxDocument;
class GrxVisualization;
class GrxStyle;

namespace grx {

// An enumeration's stable word in the XML for each number of the API.
struct EnumWord {
    int value;
    const XMLCh* word;
};

} // namespace grx

// Every object of the chart is one of these over exactly one DOM element. The wrapper is the
// element's DOM user data under the element's own (local) name, and it keeps nothing but the
// element and its document: every read goes to the DOM, so raw DOM edits show at once.
class GRX_API GrxBaseElement {
public:
    // Only a document makes wrappers, so each one belongs to that document's arena.
    class Key {
        Key() = default;
        friend class GrxDocument;
    };

    GrxBaseElement(Key, xercesc::DOMElement* element, GrxDocument* document);
    virtual ~GrxBaseElement();
    GrxBaseElement(const GrxBaseElement&) = delete;
    GrxBaseElement& operator=(const GrxBaseElement&) = delete;

    xercesc::DOMElement* getImplementation() const { return element_; }
    GrxDocument* getDocument() const { return document_; }
    GrxVisualization* getVisualization() const;

    // Ids are looked up in this object's own document; a node detached from the tree is not found.
    xercesc::DOMElement* getElementById(const XMLCh* id) const;
    xercesc::DOMElement* getElementById(const ChartString& id) const { return getElementById(id.xc_str()); }
    GrxStyle* getStyleById(const XMLCh* id) const;
    GrxStyle* getStyleById(const ChartString& id) const { return getStyleById(id.xc_str()); }
    bool doesIdExist(const XMLCh* id) const { return getElementById(id) != nullptr; }
    bool doesIdExist(const ChartString& id) const { return getElementById(id.xc_str()) != nullptr; }

    // The attribute core; absent reads as the empty text. Writing "id" declares a DOM ID.
    bool isAttributePresent(const XMLCh* name) const;
    const XMLCh* GetAttribute(const XMLCh* name) const;
    void SetAttribute(const XMLCh* name, const XMLCh* value);
    void SetAttribute(const XMLCh* name, const ChartString& value) { SetAttribute(name, value.xc_str()); }
    void removeAttribute(const XMLCh* name);
    // Copies every attribute of `from` over this element's (overwriting); an id stays findable.
    void importAttributes(const xercesc::DOMElement* from);

    const XMLCh* getId() const;
    void setId(const XMLCh* id);
    void setId(const ChartString& id) { setId(id.xc_str()); }
    bool isIdPresent() const;

    // Character content of the element (its text children joined); setting replaces them all.
    ChartString getTextContent() const;
    void setTextContent(const XMLCh* text);

    // Typed reads with a defined answer for an absent or unreadable attribute.
    bool getBool(const XMLCh* name, bool absent) const;
    void setBool(const XMLCh* name, bool value);
    int getInt(const XMLCh* name, int absent) const;
    void setInt(const XMLCh* name, int value);
    double getDouble(const XMLCh* name, double absent) const;
    void setDouble(const XMLCh* name, double value);
    // Words from `table`; a number without a word is written in decimal, and decimals read back.
    int getEnum(const XMLCh* name, const grx::EnumWord* table, std::size_t count, int absent) const;
    void setEnum(const XMLCh* name, const grx::EnumWord* table, std::size_t count, int value);
    template <std::size_t N> int getEnum(const XMLCh* name, const grx::EnumWord (&t)[N], int absent) const {
        return getEnum(name, t, N, absent);
    }
    template <std::size_t N> void setEnum(const XMLCh* name, const grx::EnumWord (&t)[N], int value) {
        setEnum(name, t, N, value);
    }

    // References: an attribute holding another object's id. Setting one gives the target an id
    // when it has none; a dangling id reads as null.
    GrxBaseElement* referenced(const XMLCh* name) const;
    void setReference(const XMLCh* name, GrxBaseElement& target);
    template <class T> T* ref(const XMLCh* name) const { return dynamic_cast<T*>(referenced(name)); }

    // Children by element name, in document order. Appending registers the new wrapper at once;
    // removal detaches the node (its ids stop answering) but the wrapper lives on with the document.
    std::vector<GrxBaseElement*> childrenNamed(const XMLCh* name) const;
    GrxBaseElement* firstChildNamed(const XMLCh* name) const;
    GrxBaseElement& appendChild(const XMLCh* name);
    void removeChildrenNamed(const XMLCh* name);
    // Detaches `child` when it is a child of this element; otherwise nothing happens.
    void removeChild(GrxBaseElement& child);

    template <class T> std::vector<T*> children(const XMLCh* name) const {
        std::vector<T*> out;
        for (GrxBaseElement* e : childrenNamed(name))
            if (T* t = dynamic_cast<T*>(e))
                out.push_back(t);
        return out;
    }
    template <class T> T* first(const XMLCh* name) const { return dynamic_cast<T*>(firstChildNamed(name)); }
    template <class T> T& add(const XMLCh* name) { return dynamic_cast<T&>(appendChild(name)); }
    template <class T> void removeAll(const XMLCh* name) { removeChildrenNamed(name); }
    // The same under T's own element name (resolved when used, so T may still be incomplete here).
    template <class T> std::vector<T*> children() const { return children<T>(T::getElementName()); }
    template <class T> T* first() const { return first<T>(T::getElementName()); }
    template <class T> T& add() { return add<T>(T::getElementName()); }
    template <class T> void removeAll() { removeChildrenNamed(T::getElementName()); }
    // A typed target seen as the base (resolved when used, like the above).
    template <class T> static GrxBaseElement& asBase(T& target) { return target; }

    // The wrapper registered on a node, or null.
    static GrxBaseElement* wrapperOf(const xercesc::DOMNode* node);
    template <class T> static T* wrapperOf(const xercesc::DOMNode* node) {
        return dynamic_cast<T*>(wrapperOf(node));
    }

private:
    xercesc::DOMElement* element_;
    GrxDocument* document_;
};

#endif

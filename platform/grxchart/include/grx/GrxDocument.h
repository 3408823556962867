#ifndef GRX_GRXDOCUMENT_H
#define GRX_GRXDOCUMENT_H

#include <grx/GrxBaseElement.h>

#include <xercesc/dom/DOMDocument.hpp>

#include <memory>

// The wrapper of a document's root: it wraps every element of a known name when it is built and
// owns every wrapper of its document (the arena), so they all die with it and never dangle.
// Never build two documents over one DOM document at the same time: the user data is shared.
class GRX_API GrxDocument : public GrxBaseElement {
public:
    // Wraps the document of `root`, which is the document element. The DOM document stays the
    // caller's unless `ownsDocument`, in which case it is released after the wrappers are gone.
    explicit GrxDocument(xercesc::DOMElement* root, bool ownsDocument = false);
    ~GrxDocument() override;

    xercesc::DOMDocument* getDOMDocument() const;
    bool ownsDocument() const { return owns_; }
    void setOwnsDocument(bool owns) { owns_ = owns; }

    // Wraps `element` and every element below it that has a known name and no wrapper yet (for
    // nodes made or imported by raw DOM calls); ids met on the way become DOM IDs. Returns the
    // wrapper of `element`, or null when its name is not known.
    GrxBaseElement* wrap(xercesc::DOMElement* element);

    static bool isKnownElement(const XMLCh* name);
    std::size_t wrapperCount() const;

private:
    template <class T> static GrxBaseElement* make(xercesc::DOMElement* e, GrxDocument* d) {
        return new T(Key(), e, d);
    }
    struct Registry;
    static const Registry& registry();
    GrxBaseElement* wrapOne(xercesc::DOMElement* element, bool overwrite);
    void wrapTree(xercesc::DOMElement* top, bool overwrite);

    struct Arena;
    std::unique_ptr<Arena> arena_;
    bool owns_;
};

#endif

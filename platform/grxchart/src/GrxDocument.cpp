#include <grx/GrxDocument.h>
#include <grx/GrxModel.h>

#include "ModelClasses.h"
#include "Names.h"

#include <xercesc/dom/DOMAttr.hpp>

#include <string_view>
#include <unordered_map>
#include <vector>

using namespace xercesc;
using grx::detail::nameOf;
using grx::detail::sameText;

struct GrxDocument::Registry {
    using Maker = GrxBaseElement* (*)(DOMElement*, GrxDocument*);
    std::unordered_map<std::u16string_view, Maker> makers;

    template <class T> void add(const XMLCh* name = T::getElementName()) { makers.emplace(name, &make<T>); }
    Maker find(const XMLCh* name) const {
        auto it = makers.find(std::u16string_view(name));
        return it == makers.end() ? nullptr : it->second;
    }
};

struct GrxDocument::Arena {
    std::vector<std::unique_ptr<GrxBaseElement>> wrappers;
};

const GrxDocument::Registry& GrxDocument::registry() {
    static const Registry r = [] {
        Registry reg;
#define GRX_REGISTER(Class) reg.add<Class>();
#define GRX_REGISTER_NAMED(Class, name) reg.add<Class>(name);
        GRX_MODEL_CLASSES(GRX_REGISTER, GRX_REGISTER_NAMED)
#undef GRX_REGISTER
#undef GRX_REGISTER_NAMED
        return reg;
    }();
    return r;
}

bool GrxDocument::isKnownElement(const XMLCh* name) {
    return name && registry().find(name) != nullptr;
}

GrxDocument::GrxDocument(DOMElement* root, bool ownsDocument)
    : GrxBaseElement(Key(), root, this), arena_(std::make_unique<Arena>()), owns_(ownsDocument) {
    if (DOMAttr* id = root->getAttributeNode(GrxUni::_id); id && !id->isId())
        root->setIdAttributeNode(id, true);
    // Whatever user data the nodes carry is stale (an earlier document over the same DOM).
    wrapTree(root, true);
}

GrxDocument::~GrxDocument() {
    DOMDocument* doc = getDOMDocument();
    arena_.reset();
    if (owns_)
        doc->release();
}

DOMDocument* GrxDocument::getDOMDocument() const {
    return getImplementation()->getOwnerDocument();
}

std::size_t GrxDocument::wrapperCount() const {
    return arena_->wrappers.size();
}

GrxBaseElement* GrxDocument::wrapOne(DOMElement* element, bool overwrite) {
    if (DOMAttr* id = element->getAttributeNode(GrxUni::_id); id && !id->isId())
        element->setIdAttributeNode(id, true);
    if (!overwrite)
        if (GrxBaseElement* existing = wrapperOf(element))
            return existing;
    // Foreign content is not the chart's; a node made without a namespace is taken as ours.
    const XMLCh* ns = element->getNamespaceURI();
    if (ns && *ns && !sameText(ns, getImplementation()->getNamespaceURI()))
        return nullptr;
    const Registry::Maker maker = registry().find(nameOf(element));
    if (!maker)
        return nullptr;
    arena_->wrappers.emplace_back(maker(element, this));
    return arena_->wrappers.back().get();
}

void GrxDocument::wrapTree(DOMElement* top, bool overwrite) {
    std::vector<DOMElement*> pending;
    for (DOMElement* c = top->getFirstElementChild(); c; c = c->getNextElementSibling())
        pending.push_back(c);
    while (!pending.empty()) {
        DOMElement* e = pending.back();
        pending.pop_back();
        wrapOne(e, overwrite);
        for (DOMElement* c = e->getFirstElementChild(); c; c = c->getNextElementSibling())
            pending.push_back(c);
    }
}

GrxBaseElement* GrxDocument::wrap(DOMElement* element) {
    if (!element || element->getOwnerDocument() != getDOMDocument())
        return nullptr;
    if (element == getImplementation())
        return this;
    GrxBaseElement* w = wrapOne(element, false);
    wrapTree(element, false);
    return w;
}

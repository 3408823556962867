#ifndef PLOTAID_TESTS_STYLEIMPORT_STYLEIMPORTSUPPORT_H
#define PLOTAID_TESTS_STYLEIMPORT_STYLEIMPORTSUPPORT_H

#include "support/EngineSupport.h"

#include <plotaid/BaseTemplate.h>

#include <xercesc/dom/DOM.hpp>

#include <string>
#include <vector>

namespace styleimport_test {

using engine_test::Chart;

// The base as an action that does nothing, to reach importStyle.
class Probe : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override { return false; }
};

inline std::string utf8(const XMLCh* s) {
    return ChartString(s).toUTF8();
}

inline Chart sample(const std::string& name) {
    return Chart::parse(engine_test::example("charts/" + name));
}

// Template "style" elements, parsed with the template grammar as a template holds them.
class StyleElements {
public:
    const XERCES_CPP_NAMESPACE::DOMElement* make(const std::string& style) {
        const std::string text = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                                 "<template xmlns=\"http://plotaid.org/grxml\" "
                                 "xmlns:xsi=\"http://www.w3.org/2001/XMLSchema-instance\" "
                                 "xsi:schemaLocation=\"http://plotaid.org/grxml "
                                 "http://plotaid.org/grxml/grxml-template-3.5.xsd\"><setStyle>" +
                                 style + "</setStyle></template>";
        if (parser_.parse(text, "style", ChartException("test style", "styleimport_test", 0)) == nullptr)
            return nullptr;
        documents_.push_back(parser_.adoptDocument());
        XERCES_CPP_NAMESPACE::DOMNodeList* found =
            documents_.back()->getElementsByTagNameNS(u"http://plotaid.org/grxml", u"style");
        return found->getLength() ? static_cast<XERCES_CPP_NAMESPACE::DOMElement*>(found->item(0)) : nullptr;
    }

private:
    plotaid::detail::ValidatingParser parser_;
    std::vector<plotaid::detail::OwnedDocument> documents_;
};

} // namespace styleimport_test

#endif

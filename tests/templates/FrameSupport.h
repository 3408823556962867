#ifndef PLOTAID_TESTS_TEMPLATES_FRAMESUPPORT_H
#define PLOTAID_TESTS_TEMPLATES_FRAMESUPPORT_H

#include "templates/TemplateSupport.h"

namespace template_test {

// A frame's locations in document order, "part:method:value-or-target;" each, a maximum as "<max";
// "<none>" without the frame.
inline std::string places(const GrxVisualization& chart, const std::string& id) {
    const GrxBaseElement* frame = byId(chart, id);
    if (frame == nullptr)
        return "<none>";
    std::string out;
    for (const GrxLocation* l : frame->children<GrxLocation>())
        out += attr(l, "part") + ":" + attr(l, "method") + ":" + attr(l, l->isTargetPresent() ? "target" : "value") +
               (l->isMaxPresent() ? "<" + attr(l, "max") : "") + ";";
    return out;
}

} // namespace template_test

#endif

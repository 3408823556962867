#ifndef PLOTAID_BENCH_SCALEDCHART_H
#define PLOTAID_BENCH_SCALEDCHART_H

#include "foundation/ValidatingParser.h"

#include <grx/ChartString.h>
#include <grx/GrxUni.h>
#include <grx/GrxVisualization.h>

#include <xercesc/dom/DOM.hpp>

#include <fstream>
#include <sstream>
#include <string>
#include <vector>

namespace bench {

// A sample chart grown to about `elements` elements by appending copies of its graphs; each copy's
// ids get a suffix so the result still validates. Empty when the sample does not parse.
inline std::string scaleChart(const std::string& samplePath, std::size_t elements) {
    using namespace XERCES_CPP_NAMESPACE;
    std::ifstream in(samplePath, std::ios::binary);
    std::ostringstream sample;
    sample << in.rdbuf();
    plotaid::detail::ValidatingParser parser;
    DOMDocument* doc = parser.parse(sample.str(), "bench", ChartException("sample chart", "bench", 0));
    if (!doc)
        return std::string();
    DOMElement* root = doc->getDocumentElement();
    std::vector<DOMElement*> graphs;
    for (DOMElement* c = root->getFirstElementChild(); c; c = c->getNextElementSibling())
        if (ChartString(c->getLocalName()).equals(GrxUni::_graph))
            graphs.push_back(c);
    const auto count = [&] { return doc->getElementsByTagName(u"*")->getLength(); };
    for (unsigned copy = 1; count() < elements && !graphs.empty(); ++copy)
        for (DOMElement* g : graphs) {
            auto* clone = static_cast<DOMElement*>(g->cloneNode(true));
            std::vector<DOMElement*> pending{clone};
            while (!pending.empty()) {
                DOMElement* e = pending.back();
                pending.pop_back();
                if (DOMAttr* id = e->getAttributeNode(GrxUni::_id)) {
                    ChartString renamed(id->getValue());
                    renamed.append(u"_").appendInteger(copy);
                    id->setValue(renamed.xc_str());
                }
                for (DOMElement* c = e->getFirstElementChild(); c; c = c->getNextElementSibling())
                    pending.push_back(c);
            }
            root->appendChild(clone);
        }
    GrxVisualization vis(root);
    return vis.AsUTF8();
}

} // namespace bench

#endif

// Bytes as a chart for the object model: whatever the validating parser accepts is wrapped, read
// through every generic accessor, edited, printed and wrapped again. Never a crash or a hang, and a
// wrapper always sits on its own node.
#include "foundation/ValidatingParser.h"

#include <grx/grx.h>

#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMElement.hpp>
#include <xercesc/dom/DOMException.hpp>
#include <xercesc/dom/DOMNamedNodeMap.hpp>
#include <xercesc/dom/DOMNodeList.hpp>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <string_view>
#include <vector>

using namespace xercesc;

namespace {

plotaid::detail::ValidatingParser* parser = nullptr;

// Reads everything the generic core offers about one wrapper.
void touch(GrxBaseElement& w) {
    const DOMNamedNodeMap* attrs = w.getImplementation()->getAttributes();
    for (XMLSize_t i = 0; i < attrs->getLength(); ++i) {
        const XMLCh* name = attrs->item(i)->getNodeName();
        (void)w.referenced(name);
        (void)w.getInt(name, 0);
        (void)w.getDouble(name, 0.0);
        (void)w.getBool(name, false);
        (void)w.getEnum(name, grx::kAxisTransform, 2);
    }
    (void)w.getTextContent();
    (void)w.doesIdExist(w.getId());
    if (auto* style = dynamic_cast<GrxStyle*>(&w)) {
        ChartString p, mn, mx;
        style->getFontSize(&p, &mn, &mx);
        style->setFontSize(nullptr, u"6pt", nullptr);
        (void)style->getVisible();
    }
    if (auto* element = dynamic_cast<CTElementType*>(&w))
        (void)element->getStatistics();
    if (auto* ext = dynamic_cast<GrxExtensionVis*>(&w))
        for (int slot = 0; slot <= 12; ++slot)
            (void)ext->getLegend(slot);
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    ::unsetenv("DumpChartXMLPath"); // no error log or dumps: the fuzzer would fill the disk
    parser = new plotaid::detail::ValidatingParser();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    if (!parser->parse(text, "ChartBase", ChartException("fuzz input refused", "fuzz", 1)))
        return 0;
    plotaid::detail::OwnedDocument owned = parser->adoptDocument();
    DOMElement* root = owned->getDocumentElement();
    GrxVisualization vis(root, true);
    owned.release(); // the visualization owns it now

    DOMNodeList* all = vis.getDOMDocument()->getElementsByTagName(u"*");
    std::vector<GrxBaseElement*> wrappers;
    for (XMLSize_t i = 0; i < all->getLength(); ++i) {
        GrxBaseElement* w = GrxBaseElement::wrapperOf(all->item(i));
        if (w && w->getImplementation() != all->item(i))
            __builtin_trap();
        if (w)
            wrappers.push_back(w);
    }
    for (GrxBaseElement* w : wrappers)
        touch(*w);
    // Remove some of what was read (chosen by the input), then read it all again.
    for (std::size_t i = 0; i < wrappers.size(); ++i) {
        if (data[i % size] % 7 != 0 || wrappers[i] == &vis)
            continue;
        DOMNode* parent = wrappers[i]->getImplementation()->getParentNode();
        if (GrxBaseElement* owner = GrxBaseElement::wrapperOf(parent))
            owner->removeChild(*wrappers[i]);
    }
    for (GrxBaseElement* w : wrappers)
        touch(*w);
    const std::string printed = vis.AsUTF8();
    if (printed.empty())
        __builtin_trap();
    return 0;
}

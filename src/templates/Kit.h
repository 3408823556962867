#ifndef PLOTAID_TEMPLATES_KIT_H
#define PLOTAID_TEMPLATES_KIT_H

// The action kit: what template actions share. The graph walk, element and aesthetic selection,
// readers of instruction attributes and children, the source guard, and the style and text
// helpers. Actions select graphs, elements and aesthetics only through here, so a chart's graphs
// are found one way whichever instruction asks.

#include <plotaid/BaseTemplate.h>

#include <grx/ChartString.h>
#include <grx/GrxEnums.h>
#include <grx/GrxModel.h>
#include <grx/GrxUni.h>

#include <xercesc/util/XercesDefs.hpp>

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace plotaid::detail {

using XERCES_CPP_NAMESPACE::DOMElement;
using XERCES_CPP_NAMESPACE::DOMNode;

// ---- the graph walk --------------------------------------------------------------------------------

// Every graph of the chart, inside containers too, in document order. Graphs sit only directly
// below the root or a container, so only those are walked: a search of the whole document would
// cost each look-up a pass over every data element.
std::vector<GrrUviza*> allGraphs(const GrxVisualization& target);

// Of `graphs` (the chart's, in order), those an instruction's "graph" attribute selects: its
// number from 1, or all for 0 or none.
std::vector<GrrUviza*> selectedGraphs(const std::vector<GrrUviza*>& graphs, const DOMElement* instruction);

// Points, lines, edges, paths, intervals, areas, polygons, schemas: kind by kind.
std::vector<CTElementType*> elementsOf(const GrrUviza& graph);

// Each graph's elements in turn, for every graph of the chart.
template <class Visit> void forEachGraphElements(const GrxVisualization& target, Visit visit) {
    for (GrrUviza* graph : allGraphs(target))
        visit(elementsOf(*graph));
}

// Style-bys, dashes, shapes, sizes, rotations, colours, offsets, patterns, transparencies, splits,
// colour components, visibilities: kind by kind. Those that may carry a legend's domain take
// labelings (before splits) instead of visibilities.
enum class AestheticList { Selectable, LegendDomains };
std::vector<CTAesthetic*> aestheticsOf(const CTElementType& element, AestheticList list = AestheticList::Selectable);

// ---- selection --------------------------------------------------------------------------------------

// An aesthetic number picks the n-th aesthetic of a kind (from 1); 0 picks all of them.
inline bool selects(std::uint32_t aestheticNumber, std::size_t position) {
    return aestheticNumber == 0 || aestheticNumber == position;
}

// The selected aesthetics of one kind on every element of every graph. An element's list is taken
// before its first step, so a step may remove the aesthetic it is given.
template <class A, class Step>
void forEachSelectedAesthetic(const GrxVisualization& target, std::uint32_t aestheticNumber,
                              std::vector<A*> (CTElementType::*kind)() const, Step step) {
    forEachGraphElements(target, [&](const std::vector<CTElementType*>& elements) {
        for (std::size_t k = 0; k < elements.size(); ++k) {
            const std::vector<A*> aesthetics = (elements[k]->*kind)();
            for (std::size_t p = 1; p <= aesthetics.size(); ++p)
                if (selects(aestheticNumber, p))
                    step(elements, k, *aesthetics[p - 1]);
        }
    });
}

// Every element of that name below the chart's root, in document order.
std::vector<DOMNode*> nodesNamed(const GrxVisualization& target, const XMLCh* name);
template <class T> std::vector<T*> allOfKind(const GrxVisualization& target, const XMLCh* name) {
    std::vector<T*> found;
    for (DOMNode* node : nodesNamed(target, name))
        if (auto* wrapper = GrxBaseElement::wrapperOf<T>(node))
            found.push_back(wrapper);
    return found;
}

// The first style with this id, depth first, each style before the styles nested in it.
GrxStyle* styleWithId(const GrxVisualization& target, const XMLCh* id);

// ---- instruction readers ----------------------------------------------------------------------------

// The enumeration value whose word `word` is; false (value untouched) for any other word.
template <std::size_t N> bool wordValue(const grx::EnumWord (&table)[N], const ChartString& word, int& value) {
    for (const grx::EnumWord& entry : table)
        if (word.equals(entry.word)) {
            value = entry.value;
            return true;
        }
    return false;
}

inline bool hasText(const XMLCh* text) {
    return text != nullptr && *text != 0;
}
bool same(const XMLCh* a, const XMLCh* b);

// The attribute's text; empty for a missing element or attribute.
ChartString attributeOf(const DOMElement* element, const XMLCh* name);
// Read as the object model reads numbers: absent or empty is 0.
std::uint32_t unsignedAttribute(const DOMElement* element, const XMLCh* name);
// Exactly "true" or "false"; anything else (absent, empty, "TRUE") gives `absent`.
bool booleanAttribute(const DOMElement* element, const XMLCh* name, bool absent);

// Template elements are matched by local name, whatever prefix the template gives them.
bool named(const DOMNode* node, const XMLCh* name);
const DOMElement* firstChildNamed(const DOMElement* parent, const XMLCh* name);
// A template may repeat a child; where one counts, the last one does.
const DOMElement* lastChildNamed(const DOMElement* parent, const XMLCh* name);
std::vector<const DOMElement*> childrenNamed(const DOMElement* parent, const XMLCh* name);
// Descendants at any depth, in document order; the element itself is not one of them.
std::vector<const DOMElement*> descendantsNamed(const DOMElement* element, const XMLCh* name);
const DOMElement* firstDescendantNamed(const DOMElement* element, const XMLCh* name);
// The element's own text: its direct text children joined, nested elements' text left out.
ChartString directText(const DOMElement* element);

template <class T> bool isA(const CTElementType& element) {
    return dynamic_cast<const T*>(&element) != nullptr;
}

// The elements an instruction's "elementType" names (absent or unknown: every element). Labelings
// are aesthetics, never elements: naming them takes no element.
struct ElementKind {
    explicit ElementKind(const DOMElement* instruction);
    bool takes(const CTElementType& element) const { return accepts_ == nullptr || accepts_(element); }
    bool labelings() const { return labelings_; }

private:
    bool (*accepts_)(const CTElementType&) = nullptr;
    bool labelings_ = false;
};

// What a cycle instruction says: which aesthetics (0: all, n: the n-th of each element) and the
// styles of their new cycle (the last "cycle" child; none changes no cycle).
struct CycleInstruction {
    explicit CycleInstruction(const DOMElement* instruction);
    std::uint32_t aestheticNumber;
    const DOMElement* cycle;
};

// ---- category lists ----------------------------------------------------------------------------------

// The text of the instruction's first "categoryValue" descendant; false without one.
bool categoryList(const DOMElement* instruction, ChartString& list);
// The list's values (split at ";", empty ones skipped), each turned into the category value the
// variable's first format relabels to it; a value no relabel knows is kept as given when
// `keepUnknown`, else left out. Joined by ";".
ChartString mappedCategories(const CTVariableType& variable, const ChartString& list, bool keepUnknown);
// Every categories entry of the domain gives way to one holding `values`.
GrxCategories& replaceCategories(GrxCategoricalDomain& domain, const ChartString& values);

// ---- the source guard --------------------------------------------------------------------------------

// The object of this id as the chart's own definition built it; null without a source. What it
// sets explicitly, the template leaves alone.
const DOMElement* sourceObject(const GrxVisualization* source, const XMLCh* id);
// The chart's own definition gives this aesthetic a cycle of its own.
bool sourceSetsCycle(const GrxVisualization* source, const CTAesthetic& aesthetic);

// ---- styles ------------------------------------------------------------------------------------------

// The style `get` reads from `owner`, or a new one under `id` (a fresh one when empty) that `set`
// attaches.
template <class Owner>
GrxStyle& styleOf(BaseTemplate& action, Owner& owner, GrxStyle* (Owner::*get)() const,
                  void (Owner::*set)(GrxStyle&), const ChartString& id) {
    if (GrxStyle* existing = (owner.*get)())
        return *existing;
    GrxStyle& made = action.addStyle(owner, id.empty() ? nullptr : id.xc_str());
    (owner.*set)(made);
    return made;
}

// The label's text frame style; one made here is transparent in both colours and hidden, so a
// title gains no box it did not have.
GrxStyle& textFrameStyleOf(BaseTemplate& action, GrxLabel& label);

// One style in `styles` per "style" child of `cycle` (a "cycle" element of the instruction), in order.
void fillCycle(BaseTemplate& action, GrxCycle& styles, const DOMElement& cycle);
// A new style cycle for an aesthetic, under a fresh id, holding the template's styles of `cycle`
// (a "cycle" element of the instruction) as one cycle.
void giveNewCycle(BaseTemplate& action, GrxVisualization& target, CTAesthetic& aesthetic,
                  const DOMElement& cycle);
// Drops the aesthetic's cycle and gives it a new one; a null `cycle` changes nothing.
void replaceCycle(BaseTemplate& action, GrxVisualization& target, CTAesthetic& aesthetic,
                  const DOMElement* cycle);

// ---- texts ------------------------------------------------------------------------------------------

std::string utf8(const XMLCh* text);
// A node as it stands in its document, for a report; its name when it cannot be printed.
std::string printed(const DOMNode* node);

} // namespace plotaid::detail

#endif

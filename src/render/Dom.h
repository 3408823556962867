// Reading the chart document for drawing: attribute text as UTF-8, children by name, elements
// by id. The renderer only reads, so these are plain views of the DOM.
#ifndef PLOTAID_RENDER_DOM_H
#define PLOTAID_RENDER_DOM_H

#include <xercesc/dom/DOM.hpp>

#include <string>
#include <vector>

namespace plotaid::render {

using Element = xercesc::DOMElement;

std::string utf8(const XMLCh* text);
std::string nameOf(const Element* e);
std::string attr(const Element* e, const char* name);
bool hasAttr(const Element* e, const char* name);
// The attribute as a number; `fallback` when absent or not a number. A trailing unit or '%' is ignored.
double number(const Element* e, const char* name, double fallback);
bool flag(const Element* e, const char* name, bool fallback);
std::vector<const Element*> children(const Element* e, const char* name = nullptr);
const Element* child(const Element* e, const char* name);
// The text of the element's first "text" child, or its own text.
std::string textOf(const Element* e);
const Element* byId(const Element* anyInDocument, const std::string& id);
// Every descendant with the name, in document order; iterative, so deep documents cannot
// exhaust the stack.
std::vector<const Element*> descendants(const Element* e, const char* name);

// A number with an optional unit: "12%" (percent), "3pt", "0.5" (plain).
struct Length {
    double value = 0;
    bool percent = false;
};
bool parseLength(const std::string& text, Length& out);
// The first part of a compound "preferred;minimum;maximum" value.
std::string preferredPart(const std::string& text);

} // namespace plotaid::render

#endif

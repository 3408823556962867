#include "render/Dom.h"

#include <xercesc/util/XMLString.hpp>

#include <cmath>
#include <cstdlib>
#include <cstring>

namespace plotaid::render {

using namespace xercesc;

std::string utf8(const XMLCh* text) {
    std::string out;
    if (text == nullptr)
        return out;
    for (const XMLCh* p = text; *p; ++p) {
        char32_t c = *p;
        if (c >= 0xD800 && c < 0xDC00 && p[1] >= 0xDC00 && p[1] < 0xE000) {
            c = 0x10000 + ((c - 0xD800) << 10) + (p[1] - 0xDC00);
            ++p;
        } else if (c >= 0xD800 && c < 0xE000) {
            c = 0xFFFD;
        }
        if (c < 0x80) {
            out += static_cast<char>(c);
        } else if (c < 0x800) {
            out += static_cast<char>(0xC0 | (c >> 6));
            out += static_cast<char>(0x80 | (c & 0x3F));
        } else if (c < 0x10000) {
            out += static_cast<char>(0xE0 | (c >> 12));
            out += static_cast<char>(0x80 | ((c >> 6) & 0x3F));
            out += static_cast<char>(0x80 | (c & 0x3F));
        } else {
            out += static_cast<char>(0xF0 | (c >> 18));
            out += static_cast<char>(0x80 | ((c >> 12) & 0x3F));
            out += static_cast<char>(0x80 | ((c >> 6) & 0x3F));
            out += static_cast<char>(0x80 | (c & 0x3F));
        }
    }
    return out;
}

namespace {
std::u16string wide(const char* ascii) {
    return std::u16string(ascii, ascii + std::strlen(ascii));
}
bool named(const DOMNode* n, const char* name) {
    if (n->getNodeType() != DOMNode::ELEMENT_NODE)
        return false;
    if (name == nullptr)
        return true;
    const XMLCh* local = n->getLocalName() ? n->getLocalName() : n->getNodeName();
    return wide(name) == std::u16string(local);
}
} // namespace

std::string nameOf(const Element* e) {
    if (e == nullptr)
        return {};
    return utf8(e->getLocalName() ? e->getLocalName() : e->getNodeName());
}

std::string attr(const Element* e, const char* name) {
    if (e == nullptr)
        return {};
    return utf8(e->getAttribute(reinterpret_cast<const XMLCh*>(wide(name).c_str())));
}

bool hasAttr(const Element* e, const char* name) {
    return e != nullptr && e->hasAttribute(reinterpret_cast<const XMLCh*>(wide(name).c_str()));
}

bool parseLength(const std::string& text, Length& out) {
    const char* begin = text.c_str();
    while (*begin == ' ')
        ++begin;
    char* end = nullptr;
    const double v = std::strtod(begin, &end);
    if (end == begin || !std::isfinite(v))
        return false;
    out.value = v;
    out.percent = *end == '%';
    return true;
}

std::string preferredPart(const std::string& text) {
    return text.substr(0, text.find(';'));
}

double number(const Element* e, const char* name, double fallback) {
    Length l;
    return parseLength(preferredPart(attr(e, name)), l) ? l.value : fallback;
}

bool flag(const Element* e, const char* name, bool fallback) {
    const std::string v = attr(e, name);
    if (v == "true" || v == "1")
        return true;
    if (v == "false" || v == "0")
        return false;
    return fallback;
}

std::vector<const Element*> children(const Element* e, const char* name) {
    std::vector<const Element*> out;
    if (e == nullptr)
        return out;
    for (const DOMNode* n = e->getFirstChild(); n; n = n->getNextSibling())
        if (named(n, name))
            out.push_back(static_cast<const Element*>(n));
    return out;
}

const Element* child(const Element* e, const char* name) {
    if (e == nullptr)
        return nullptr;
    for (const DOMNode* n = e->getFirstChild(); n; n = n->getNextSibling())
        if (named(n, name))
            return static_cast<const Element*>(n);
    return nullptr;
}

std::string textOf(const Element* e) {
    if (const Element* t = child(e, "text"))
        e = t;
    return e ? utf8(e->getTextContent()) : std::string();
}

const Element* byId(const Element* anyInDocument, const std::string& id) {
    if (anyInDocument == nullptr || id.empty())
        return nullptr;
    std::u16string w;
    // Ids are ASCII names in every chart we write; anything else cannot match.
    for (char c : id)
        w += static_cast<char16_t>(static_cast<unsigned char>(c));
    return anyInDocument->getOwnerDocument()->getElementById(reinterpret_cast<const XMLCh*>(w.c_str()));
}

std::vector<const Element*> descendants(const Element* e, const char* name) {
    std::vector<const Element*> out;
    if (e == nullptr)
        return out;
    const DOMNode* n = e->getFirstChild();
    while (n != nullptr) {
        if (named(n, name))
            out.push_back(static_cast<const Element*>(n));
        if (n->getFirstChild() != nullptr) {
            n = n->getFirstChild();
            continue;
        }
        while (n != nullptr && n != e && n->getNextSibling() == nullptr)
            n = n->getParentNode();
        if (n == nullptr || n == e)
            break;
        n = n->getNextSibling();
    }
    return out;
}

} // namespace plotaid::render

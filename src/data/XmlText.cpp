#include "data/XmlText.h"

#include <osport/osport.h>

#include <algorithm>
#include <charconv>
#include <cstdint>

namespace plotaid::detail {

bool appendEscaped(std::string& out, const std::string& text, EscapeKind kind) {
    bool whole = true;
    const char* p = text.data();
    const char* const end = p + text.size();
    const char* plain = p; // start of the run not yet copied
    while (p < end) {
        const unsigned char c = static_cast<unsigned char>(*p);
        if (c >= 0x80) {
            // A lead byte; text is NUL-terminated, so a cut character cannot step past its end.
            const char* next = osport::KovarMBstrinc_A(p);
            p = (next > p && next <= end) ? next : p + 1;
            continue;
        }
        const char* replacement = nullptr;
        switch (c) {
        case '"':
            replacement = "&quot;";
            break;
        case '&':
            replacement = "&amp;";
            break;
        case '\'':
            replacement = "&apos;";
            break;
        case '<':
            replacement = "&lt;";
            break;
        case '>':
            replacement = "&gt;";
            break;
        case '\t':
            replacement = "&#9;";
            break;
        case '\n':
            replacement = "&#10;";
            break;
        case '\r':
            replacement = "&#13;";
            break;
        case ';':
            if (kind == EscapeKind::VariableName)
                replacement = "&#59;";
            else if (kind == EscapeKind::Value)
                replacement = ",";
            break;
        default:
            // No form of XML 1.0, not even a character reference, can hold the other controls.
            if (c < 0x20) {
                replacement = "?";
                whole = false;
            }
            break;
        }
        if (replacement) {
            out.append(plain, p);
            out.append(replacement);
            plain = p + 1;
        }
        ++p;
    }
    out.append(plain, end);
    return whole;
}

namespace {

void appendUtf8(std::string& out, std::uint32_t cp) {
    if (cp < 0x80) {
        out += static_cast<char>(cp);
    } else if (cp < 0x800) {
        out += static_cast<char>(0xC0 | cp >> 6);
        out += static_cast<char>(0x80 | (cp & 0x3F));
    } else if (cp < 0x10000) {
        out += static_cast<char>(0xE0 | cp >> 12);
        out += static_cast<char>(0x80 | (cp >> 6 & 0x3F));
        out += static_cast<char>(0x80 | (cp & 0x3F));
    } else {
        out += static_cast<char>(0xF0 | cp >> 18);
        out += static_cast<char>(0x80 | (cp >> 12 & 0x3F));
        out += static_cast<char>(0x80 | (cp >> 6 & 0x3F));
        out += static_cast<char>(0x80 | (cp & 0x3F));
    }
}

// The length of the reference at text[0] == '&' that was resolved into out, or 0.
std::size_t resolve(std::string_view text, std::string& out) {
    const std::size_t semi = text.find(';', 1);
    if (semi == std::string_view::npos || semi > 12)
        return 0;
    const std::string_view name = text.substr(1, semi - 1);
    static constexpr std::pair<std::string_view, char> kNamed[] = {
        {"quot", '"'}, {"amp", '&'}, {"apos", '\''}, {"lt", '<'}, {"gt", '>'}};
    for (const auto& [entity, c] : kNamed) {
        if (name == entity) {
            out += c;
            return semi + 1;
        }
    }
    if (name.size() < 2 || name[0] != '#')
        return 0;
    const bool hex = name[1] == 'x' || name[1] == 'X';
    const std::string_view digits = name.substr(hex ? 2 : 1);
    std::uint32_t cp = 0;
    const auto r = std::from_chars(digits.data(), digits.data() + digits.size(), cp, hex ? 16 : 10);
    if (digits.empty() || r.ec != std::errc() || r.ptr != digits.data() + digits.size() || cp == 0 ||
        cp > 0x10FFFF || (cp >= 0xD800 && cp <= 0xDFFF))
        return 0;
    appendUtf8(out, cp);
    return semi + 1;
}

} // namespace

std::string unescape(std::string_view text) {
    std::string out;
    std::size_t amp = text.find('&');
    if (amp == std::string_view::npos)
        return std::string(text);
    out.reserve(text.size());
    std::size_t done = 0;
    while (amp != std::string_view::npos) {
        out.append(text.substr(done, amp - done));
        const std::size_t used = resolve(text.substr(amp), out);
        if (used == 0) {
            out += '&';
            done = amp + 1;
        } else {
            done = amp + used;
        }
        amp = text.find('&', done);
    }
    out.append(text.substr(done));
    return out;
}

} // namespace plotaid::detail

#ifndef PLOTAID_DATA_XMLTEXT_H
#define PLOTAID_DATA_XMLTEXT_H

#include <string>
#include <string_view>

namespace plotaid::detail {

enum class EscapeKind {
    SourceName,   // attribute value
    VariableName, // field of the ";"-separated names list: a ';' becomes "&#59;" so the list splits right
    Value,        // field of a row: a ';' becomes ',' (as the data form has always written it)
};

// Appends text with the XML special characters replaced; multibyte characters of the host encoding
// are stepped over whole, so none of their bytes is taken for one of those characters. Tab, line
// feed and carriage return go out as character references, so they come back as they were; XML 1.0
// cannot hold the other control characters at all, so each becomes '?' and false is returned.
bool appendEscaped(std::string& out, const std::string& text, EscapeKind kind);

// Resolves the five predefined entities and numeric character references (written as UTF-8);
// anything else, including unknown or malformed references, stays as it stands.
std::string unescape(std::string_view text);

} // namespace plotaid::detail

#endif

#ifndef PLOTAID_XMLSTRING_H
#define PLOTAID_XMLSTRING_H

#include <plotaid/Export.h>

#include <xercesc/util/XercesDefs.hpp>

#include <string>

// A host multibyte text turned into UTF-16 for the DOM. Each object owns its own buffer, so copies
// never give one buffer back twice. getChars() is null when the text is not valid in the host
// encoding (or was null).
class PLOTAID_API xmlString {
public:
    explicit xmlString(std::string text);
    explicit xmlString(const char* text);
    xmlString(const xmlString& other);
    xmlString(xmlString&& other) noexcept;
    xmlString& operator=(const xmlString& other);
    xmlString& operator=(xmlString&& other) noexcept;
    ~xmlString();

    const XMLCh* getChars() const noexcept { return chars_; }

private:
    // Kept so that a copy can get its buffer from the host's converter like the original.
    std::string source_;
    XMLCh* chars_ = nullptr;
};

#endif

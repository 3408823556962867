#include <plotaid/xmlString.h>

#include <osport/osport.h>

#include <utility>

namespace {

XMLCh* transcode(const std::string& text) {
    return osport::KovarMBTranscodeGeneric(text.c_str());
}

void release(XMLCh* chars) {
    if (chars != nullptr)
        osport::KovarMBRelease(chars);
}

} // namespace

xmlString::xmlString(std::string text) : source_(std::move(text)), chars_(transcode(source_)) {}

xmlString::xmlString(const char* text)
    : source_(text ? text : ""), chars_(text ? transcode(source_) : nullptr) {}

// Buffers come only from the host's converter and go back only to it.
xmlString::xmlString(const xmlString& other)
    : source_(other.source_), chars_(other.chars_ ? transcode(source_) : nullptr) {}

xmlString::xmlString(xmlString&& other) noexcept
    : source_(std::move(other.source_)), chars_(std::exchange(other.chars_, nullptr)) {}

xmlString& xmlString::operator=(const xmlString& other) {
    if (this != &other) {
        XMLCh* chars = other.chars_ ? transcode(other.source_) : nullptr;
        source_ = other.source_;
        release(chars_);
        chars_ = chars;
    }
    return *this;
}

xmlString& xmlString::operator=(xmlString&& other) noexcept {
    if (this != &other) {
        release(chars_);
        source_ = std::move(other.source_);
        chars_ = std::exchange(other.chars_, nullptr);
    }
    return *this;
}

xmlString::~xmlString() {
    release(chars_);
}

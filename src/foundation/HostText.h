#ifndef PLOTAID_FOUNDATION_HOSTTEXT_H
#define PLOTAID_FOUNDATION_HOSTTEXT_H

#include <osport/osport.h>

#include <memory>
#include <string>

namespace plotaid::detail {

// Owners of the buffers that osport's conversions hand out.
struct HostTextRelease {
    void operator()(char* p) const noexcept { osport::KovarMBRelease(p); }
};
struct WideTextRelease {
    void operator()(char16_t* p) const noexcept { osport::KovarMBRelease(p); }
};
using HostText = std::unique_ptr<char, HostTextRelease>;
using WideText = std::unique_ptr<char16_t, WideTextRelease>;

// UTF-16 to host text; empty for null or for text the host encoding cannot hold.
inline std::string toHost(const char16_t* text) {
    if (text == nullptr)
        return std::string();
    const HostText converted(osport::KovarMBTranscodeGeneric(text));
    return converted ? std::string(converted.get()) : std::string();
}

// Host text to UTF-16; null for text that is not valid in the host encoding.
inline WideText toWide(const char* text) {
    return WideText(osport::KovarMBTranscodeGeneric(text));
}

} // namespace plotaid::detail

#endif

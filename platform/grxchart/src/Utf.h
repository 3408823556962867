#ifndef GRX_DETAIL_UTF_H
#define GRX_DETAIL_UTF_H

#include <string>

namespace grx::detail {

// Malformed input never fails: each bad sequence becomes U+FFFD.
std::u16string utf8ToUtf16(const std::string& utf8);
std::string utf16ToUtf8(const std::u16string& utf16);

} // namespace grx::detail

#endif

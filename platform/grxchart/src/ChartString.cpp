#include <grx/ChartString.h>
#include <grx/formatter.h>

#include "Utf.h"

#include <charconv>
#include <climits>
#include <cmath>

using grx::detail::utf16ToUtf8;
using grx::detail::utf8ToUtf16;

namespace {

bool isBlank(char16_t c) {
    return c == u' ' || c == u'\t' || c == u'\n' || c == u'\r' || c == u'\f' || c == u'\v';
}
bool isDigit(char16_t c) {
    return c >= u'0' && c <= u'9';
}

// Sign and magnitude of the leading integer; the magnitude stops growing past `cap`.
struct LeadingInteger {
    bool negative = false;
    unsigned long long magnitude = 0;
};

LeadingInteger readLeadingInteger(const std::u16string& s, unsigned long long cap) {
    LeadingInteger out;
    std::size_t i = 0;
    while (i < s.size() && isBlank(s[i]))
        ++i;
    if (i < s.size() && (s[i] == u'+' || s[i] == u'-')) {
        out.negative = s[i] == u'-';
        ++i;
    }
    for (; i < s.size() && isDigit(s[i]); ++i) {
        out.magnitude = out.magnitude * 10 + static_cast<unsigned>(s[i] - u'0');
        if (out.magnitude > cap)
            out.magnitude = cap + 1; // keeps the loop bounded and marks overflow
    }
    return out;
}

// The ASCII text of the leading number, with blanks and a '+' dropped (from_chars refuses both).
std::string numberPrefix(const std::u16string& s, std::size_t* consumedAll) {
    std::size_t i = 0;
    while (i < s.size() && isBlank(s[i]))
        ++i;
    std::string ascii;
    if (i < s.size() && s[i] == u'+')
        ++i;
    std::size_t start = i;
    for (; i < s.size() && s[i] < 0x80 && !isBlank(s[i]); ++i)
        ascii.push_back(static_cast<char>(s[i]));
    std::size_t end = i;
    while (i < s.size() && isBlank(s[i]))
        ++i;
    if (consumedAll)
        *consumedAll = (i == s.size() && end > start) ? 1 : 0;
    return ascii;
}

} // namespace

ChartString::ChartString(const XMLCh* text) {
    if (text)
        text_ = text;
}

ChartString::ChartString(const char* utf8) {
    if (utf8)
        text_ = utf8ToUtf16(utf8);
}

ChartString::ChartString(const std::string& utf8) : text_(utf8ToUtf16(utf8)) {}

std::string ChartString::toUTF8() const {
    return utf16ToUtf8(text_);
}

bool ChartString::equals(const XMLCh* text) const {
    return text ? text_ == text : text_.empty();
}

bool ChartString::ContainsString(const XMLCh* part) const {
    return part && text_.find(part) != std::u16string::npos;
}

ChartString& ChartString::assign(const XMLCh* text) {
    if (text)
        text_ = text;
    else
        text_.clear();
    return *this;
}

ChartString& ChartString::append(const XMLCh* text) {
    if (text)
        text_ += text;
    return *this;
}

ChartString& ChartString::append(const ChartString& other) {
    text_ += other.text_;
    return *this;
}

ChartString& ChartString::appendInteger(long long value) {
    const std::string digits = std::to_string(value);
    text_.append(digits.begin(), digits.end());
    return *this;
}

ChartString& ChartString::assignDouble(double value, int digits) {
    const std::string text = formatter::AsString(value, digits);
    text_.assign(text.begin(), text.end());
    return *this;
}

ChartString& ChartString::replaceSubstring(const ChartString& from, const ChartString& to) {
    if (from.empty())
        return *this;
    std::u16string out;
    std::size_t pos = 0;
    for (std::size_t hit; (hit = text_.find(from.text_, pos)) != std::u16string::npos;
         pos = hit + from.length()) {
        out.append(text_, pos, hit - pos);
        out += to.text_;
    }
    out.append(text_, pos, std::u16string::npos);
    text_.swap(out);
    return *this;
}

ChartString& ChartString::truncateString(unsigned count) {
    text_.resize(count >= text_.size() ? 0 : text_.size() - count);
    return *this;
}

unsigned ChartString::convertToInteger() const {
    const LeadingInteger n = readLeadingInteger(text_, UINT_MAX);
    if (n.magnitude > UINT_MAX)
        return UINT_MAX;
    const auto m = static_cast<unsigned>(n.magnitude);
    return n.negative ? 0u - m : m;
}

int ChartString::convertToSignedInteger() const {
    const LeadingInteger n = readLeadingInteger(text_, static_cast<unsigned long long>(INT_MAX) + 1);
    if (n.negative)
        return n.magnitude > static_cast<unsigned long long>(INT_MAX) ? INT_MIN
                                                                      : -static_cast<int>(n.magnitude);
    return n.magnitude > static_cast<unsigned long long>(INT_MAX) ? INT_MAX : static_cast<int>(n.magnitude);
}

double ChartString::convertToDouble() const {
    const std::string ascii = numberPrefix(text_, nullptr);
    double value = 0.0;
    const auto r = std::from_chars(ascii.data(), ascii.data() + ascii.size(), value);
    if (r.ec == std::errc::result_out_of_range) {
        // Keep strtod's answer for out-of-range texts: a huge magnitude or zero, with the sign.
        const bool negative = !ascii.empty() && ascii[0] == '-';
        std::size_t e = ascii.find_first_of("eE");
        const bool tiny = e != std::string::npos && e + 1 < ascii.size() && ascii[e + 1] == '-';
        return tiny ? (negative ? -0.0 : 0.0) : (negative ? -HUGE_VAL : HUGE_VAL);
    }
    return r.ec == std::errc() ? value : 0.0;
}

bool ChartString::isNumber() const {
    std::size_t whole = 0;
    const std::string ascii = numberPrefix(text_, &whole);
    if (!whole || ascii.empty())
        return false;
    // Only plain decimal forms: no "inf", "nan" or hexadecimal.
    for (char c : ascii)
        if (!(isDigit(static_cast<char16_t>(c)) || c == '.' || c == '-' || c == '+' || c == 'e' || c == 'E'))
            return false;
    double value = 0.0;
    const auto r = std::from_chars(ascii.data(), ascii.data() + ascii.size(), value);
    return r.ec == std::errc() && r.ptr == ascii.data() + ascii.size() && std::isfinite(value);
}

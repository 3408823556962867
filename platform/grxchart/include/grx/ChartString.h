#ifndef GRX_CHARTSTRING_H
#define GRX_CHARTSTRING_H

#include <grx/Export.h>

#include <xercesc/util/XercesDefs.hpp>

#include <cstddef>
#include <string>

// The object model's text value: UTF-16, built from UTF-16 or from UTF-8 text.
class GRX_API ChartString {
public:
    ChartString() = default;
    ChartString(const XMLCh* text); // null reads as empty
    ChartString(const char* utf8);  // null reads as empty
    ChartString(const std::string& utf8);
    ChartString(std::u16string text) : text_(std::move(text)) {}

    bool empty() const { return text_.empty(); }
    std::size_t length() const { return text_.size(); }
    const XMLCh* xc_str() const { return text_.c_str(); }
    const std::u16string& str() const { return text_; }
    std::string toUTF8() const;

    // Exact, case-sensitive comparison; a null text equals the empty string.
    bool equals(const XMLCh* text) const;
    bool equals(const ChartString& other) const { return text_ == other.text_; }
    bool equals(const char* utf8) const { return equals(ChartString(utf8)); }
    bool ContainsString(const XMLCh* part) const;
    bool ContainsString(const ChartString& part) const { return ContainsString(part.xc_str()); }

    ChartString& assign(const XMLCh* text);
    ChartString& assign(const ChartString& other) { return *this = other; }
    ChartString& assign(const char* utf8) { return *this = ChartString(utf8); }
    ChartString& append(const XMLCh* text);
    ChartString& append(const ChartString& other);
    ChartString& append(const char* utf8) { return append(ChartString(utf8)); }
    ChartString& appendInteger(long long value);
    // The number with at most `digits` significant digits in its shortest form; -0 reads "0".
    ChartString& assignDouble(double value, int digits);
    // Every occurrence; an empty `from` changes nothing.
    ChartString& replaceSubstring(const ChartString& from, const ChartString& to);
    // Drops `count` characters from the end (all of them when there are fewer).
    ChartString& truncateString(unsigned count);

    // Leading blanks, an optional sign and the leading digits, as strtoul reads them: no digits
    // reads 0, "0.5" reads 0, "-1" reads 4294967295 (-1 once cast to int); overflow saturates.
    unsigned convertToInteger() const;
    // The same prefix read as a signed number, saturating at the int range.
    int convertToSignedInteger() const;
    // The leading decimal number with '.' whatever the locale; no number reads 0.
    double convertToDouble() const;
    // The whole text (blanks around it allowed) is one finite decimal number.
    bool isNumber() const;

    ChartString& operator+=(const ChartString& other) { return append(other); }
    friend ChartString operator+(ChartString a, const ChartString& b) { return a.append(b); }
    friend bool operator==(const ChartString& a, const ChartString& b) { return a.text_ == b.text_; }
    friend bool operator!=(const ChartString& a, const ChartString& b) { return a.text_ != b.text_; }
    friend bool operator<(const ChartString& a, const ChartString& b) { return a.text_ < b.text_; }

private:
    std::u16string text_;
};

#endif

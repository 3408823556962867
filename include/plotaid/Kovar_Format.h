#ifndef PLOTAID_KOVAR_FORMAT_H
#define PLOTAID_KOVAR_FORMAT_H

#include <plotaid/Export.h>

#include <cstdint>

// The host's print format of a variable: width, type code and decimals in four bytes. Only the
// text types (1 and 2) may be wider than 40 characters; other widths are lowered to 40.
class PLOTAID_API Kovar_Format {
public:
    static constexpr std::uint16_t kMaxNumericWidth = 40;

    Kovar_Format() = default;
    Kovar_Format(std::uint8_t type, std::uint16_t width, std::uint8_t decimals)
        : type_(type), decimals_(decimals) {
        SetWidth(width);
    }

    std::uint16_t GetWidth() const { return width_; }
    std::uint8_t GetType() const { return type_; }
    std::uint8_t GetDecimals() const { return decimals_; }
    bool IsString() const { return type_ == 1 || type_ == 2; }

    void SetWidth(std::uint16_t width) {
        width_ = (width <= kMaxNumericWidth || IsString()) ? width : kMaxNumericWidth;
    }
    // A new type re-applies the width rule, so a wide text format turned numeric is narrowed.
    void SetType(std::uint8_t type) {
        type_ = type;
        SetWidth(width_);
    }
    void SetDecimals(std::uint8_t decimals) { decimals_ = decimals; }

    bool operator==(const Kovar_Format& o) const {
        return width_ == o.width_ && type_ == o.type_ && decimals_ == o.decimals_;
    }
    bool operator!=(const Kovar_Format& o) const { return !(*this == o); }

private:
    std::uint16_t width_ = 8;
    std::uint8_t type_ = 5;
    std::uint8_t decimals_ = 2;
};

#endif

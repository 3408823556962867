#ifndef KOVAR_KOVARCONV_H
#define KOVAR_KOVARCONV_H

#include <plotaid/Kovar_Format.h>

#include <string>

// The host's conversion library: the five custom currencies and value printing.
namespace kovar {

struct customCurrency {
    std::string prefix;
    std::string suffix;
    std::string negativePrefix;
    std::string negativeSuffix;
    std::string decimalIndicator;
};

class currencyFormat {
public:
    static constexpr int kCount = 5;
    // Index 0 to 4; any other index gives the default definition (negative prefix "-", ".").
    customCurrency GetCCX(int index) const;
    // Ignored for an index outside 0 to 4.
    static void SetCCX(int index, const customCurrency& currency);
    static void ResetCCX();
};

// The host's missing value.
constexpr double kMissingValue = -1.7976931348623157e308;

// The value printed in the format, right-aligned to the format's width; asterisks when it does
// not fit, "." for the missing value. Independent of the process locale.
void ToString(double value, const Kovar_Format& format, std::string& buffer);

} // namespace kovar

#endif

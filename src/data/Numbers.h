#ifndef PLOTAID_DATA_NUMBERS_H
#define PLOTAID_DATA_NUMBERS_H

#include <string>

// Numbers of the data forms always use '.', whatever the process locale, and never switch it.
namespace plotaid::detail {

// A cell as the data forms show it: empty for the missing value, "%d" for a whole number in the
// 32-bit range, else 16 significant digits.
std::string formatCell(double value);
void appendCell(std::string& out, double value);

// Reads a number the way atof does (leading blanks, sign, decimal or hexadecimal, inf, nan; text
// that is no number reads as 0) from [first, last), never past last. Returns true when the number
// covers the whole text apart from surrounding blanks.
bool parseNumber(const char* first, const char* last, double& value);

} // namespace plotaid::detail

#endif

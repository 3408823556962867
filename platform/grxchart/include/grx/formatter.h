#ifndef GRX_FORMATTER_H
#define GRX_FORMATTER_H

#include <grx/Export.h>

#include <string>

namespace formatter {

// `value` with at most `digits` significant digits, trailing zeros dropped, '.' as the decimal point
// whatever the process locale; negative zero prints "0". `digits` outside 1..17 means the shortest
// text that reads back as the same double.
GRX_API std::string AsString(double value, int digits);

} // namespace formatter

#endif

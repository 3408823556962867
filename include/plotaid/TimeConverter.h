#ifndef PLOTAID_TIMECONVERTER_H
#define PLOTAID_TIMECONVERTER_H

#include <plotaid/Export.h>

#include <string>

// ISO-style date and time texts to the host's time value: seconds since the start of
// 14 October 1582, the first day of the Gregorian calendar. Dates the host cannot represent
// give the host's missing value (the most negative finite double). Nothing is reported: texts
// that are not numbers read as 0.
class PLOTAID_API TimeConverter {
public:
    // Seconds at 00:00 of that day. Day 0 is the last day of the previous month, days past the
    // month's end run into the next month, month 13 is January of the next year.
    static double ConvertYearMonthDayToSecs(unsigned year, unsigned month, unsigned day);
    // "YYYY-MM-DD", optionally followed by a blank and a time as below.
    static double convertDateFromISOFormatToKovarDouble(const std::string& text);
    // "H:M", "H:M:S", "H:M:S.fff" or "H:M:S,fff"; seconds of a time of day or a duration.
    static double convertTimeFromISOFormatToKovarDouble(const std::string& text);
    // Decimal digits only, modulo 2^32; 0 for an empty text or any other character.
    static unsigned convertStringToUnsignedInt(const std::string& text);
};

#endif

#include <plotaid/ChartBase.h>
#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>
#include <plotaid/Kovar_Format.h>

#include "foundation/HostText.h"
#include <grx/GrxModel.h>
#include <grx/GrxUni.h>
#include <kovar/kovarbase.h>
#include <kovar/kovarconv.h>
#include <kovar/kovarwin.h>

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <exception>
#include <memory>

namespace plotaid::detail {
namespace {

const char* const kSource = "backend/chartxml/plotaid/src/chartbase";

// The host's system block, fetched once as the host hands it out at load.
const unsigned char* systemBlock() {
    static const unsigned char* block = static_cast<const unsigned char*>(kovar::pvGetCmnSys());
    return block;
}

bool hostGroupsDigits() {
    const unsigned char* block = systemBlock();
    if (!block)
        return false;
    std::uint64_t value;
    std::memcpy(&value, block + kovar::kCmnSysDigitGrouping, sizeof value);
    return value != 0;
}

// No number of the host is wider than 40 characters, so neither is its integer part; the bound
// also keeps a corrupt setting from turning negative.
int clampIntegerDigits(long long digits) {
    return static_cast<int>(std::clamp<long long>(digits, 0, Kovar_Format::kMaxNumericWidth));
}

int hostMinimumIntegerDigits() {
    const unsigned char* block = systemBlock();
    if (!block)
        return 1;
    std::uint32_t value;
    std::memcpy(&value, block + kovar::kCmnSysMinIntegerDigits, sizeof value);
    return clampIntegerDigits(value);
}

void showFraction(GrxFormat& format, int decimals) {
    const int digits = std::max(3, decimals);
    format.setShowMilliseconds(true);
    format.setMinimumFractionDigits(digits);
    format.setMaximumFractionDigits(digits);
}

void noTimeOfDay(GrxFormat& format) {
    format.setShowHour(false);
    format.setShowMinute(false);
    format.setShowSecond(false);
    format.setShowMilliseconds(false);
}

// Types 23, 38 and 39: year, month number and day, differing in separators and order.
void numericDate(GrxFormat& format, int width, const XMLCh* separators, int order) {
    format.setBaseFormat(CTFormatType::baseFormat_dateTime);
    format.setShowYear(true);
    format.setShowMonth(true);
    format.setShowDay(true);
    noTimeOfDay(format);
    format.setDayPadding(true);
    format.setDayOfMonthPadding(true);
    format.setDayType(CTFormatType::dayType_dayOfMonth);
    format.setMonthFormat(CTFormatType::monthFormat_number);
    format.setYearAbbreviation(width < 9);
    format.setSeparators(separators);
    format.setMdyOrder(order);
}

// Currency texts are the host's multibyte text, not necessarily UTF-8.
ChartString hostText(const std::string& text) {
    const plotaid::detail::WideText wide = plotaid::detail::toWide(text.c_str());
    return wide ? ChartString(std::u16string(wide.get())) : ChartString(text);
}

// Host-facing: a failure of the object model is reported and gives false.
template <typename Body> bool reported(Body body, unsigned line) {
    try {
        return body();
    } catch (const std::exception& e) {
        ChartErrorHandler().error(
            ChartException(std::string("format conversion failed: ") + e.what(), kSource, line));
    } catch (...) {
        ChartErrorHandler().error(ChartException("format conversion failed", kSource, line));
    }
    return false;
}

} // namespace
} // namespace plotaid::detail

using namespace plotaid::detail;

bool ChartBase::addFormat(GrxFormat& format, const Kovar_Format& hostFormat) {
    return reported(
        [&] {
            format.setErrorCharacter(u"*");
            switch (hostFormat.GetType()) {
            case 3:
            case 4:
            case 5:
            case 8:
            case 9:
            case 12:
            case 15:
            case 16:
            case 17:
            case 31:
            case 32:
            case 40:
                return FormatNumber(format, hostFormat);
            case 20:
            case 21:
            case 22:
            case 23:
            case 24:
            case 28:
            case 29:
            case 30:
            case 38:
            case 39:
                return FormatDate(format, hostFormat);
            case 25:
                return FormatElapsedTime(format, hostFormat);
            case 33:
            case 34:
            case 35:
            case 36:
            case 37:
                return FormatCustomCurrency(format, hostFormat);
            default:
                // Text formats and the types charts print as plain numbers keep the format as is.
                return true;
            }
        },
        __LINE__);
}

bool ChartBase::FormatNumber(GrxFormat& format, const Kovar_Format& hostFormat) {
    return reported(
        [&] {
            const int width = hostFormat.GetWidth();
            const int decimals = hostFormat.GetDecimals();
            format.setMinimumFractionDigits(decimals);
            format.setMaximumFractionDigits(decimals);
            format.setScientific(CTFormatType::scientific_auto);
            format.setMinimumIntegerDigits(hostMinimumIntegerDigits());
            format.setUseGrouping(false);
            const bool grouping = hostGroupsDigits();

            switch (hostFormat.GetType()) {
            case 3:
                format.setUseGrouping(true);
                format.setSeparators(u".,/:");
                return true;
            case 4:
                format.setPrefix(u"$");
                format.setUseGrouping(true);
                format.setSeparators(u".,/:");
                return true;
            case 5:
                format.setScientific(CTFormatType::scientific_exponent);
                format.setSmallNumberThreshold(0.0);
                format.setUseGrouping(grouping);
                return true;
            case 8:
            case 9:
            case 12:
                return true;
            case 15:
                format.setMinimumIntegerDigits(clampIntegerDigits(width - decimals - 1));
                format.setUseGrouping(grouping);
                return true;
            case 16:
                format.setMinimumIntegerDigits(clampIntegerDigits(width - decimals));
                format.setUseGrouping(grouping);
                return true;
            case 17:
                format.setScientific(CTFormatType::scientific_always);
                format.setUseGrouping(grouping);
                return true;
            case 31:
                format.setSuffix(u"%");
                format.setUseGrouping(grouping);
                return true;
            case 32:
                format.setUseGrouping(true);
                format.setSeparators(u",./:");
                return true;
            case 40:
                format.setScientific(CTFormatType::scientific_exponent);
                format.setSmallNumberThreshold(kovar::GETGFORMATSMALL());
                format.setUseGrouping(grouping);
                return true;
            default:
                return false;
            }
        },
        __LINE__);
}

bool ChartBase::FormatDate(GrxFormat& format, const Kovar_Format& hostFormat) {
    const int type = hostFormat.GetType();
    if (type < 20 || type > 39 || type == 25 || (type >= 31 && type <= 37))
        return false;
    return reported(
        [&] {
            const int width = hostFormat.GetWidth();
            const int decimals = hostFormat.GetDecimals();
            switch (type) {
            case 20:
                format.setBaseFormat(CTFormatType::baseFormat_dateTime);
                format.setShowDay(true);
                format.setShowMonth(true);
                format.setShowYear(true);
                noTimeOfDay(format);
                format.setDayPadding(true);
                format.setDayOfMonthPadding(true);
                format.setDayType(CTFormatType::dayType_dayOfMonth);
                format.setMonthFormat(CTFormatType::monthFormat_short);
                format.setYearAbbreviation(width < 10);
                format.setSeparators(u".,-:");
                format.setMdyOrder(CTFormatType::mdyOrder_1);
                break;
            case 21: {
                const bool seconds = width >= 6;
                format.setBaseFormat(CTFormatType::baseFormat_elapsed);
                format.setShowHour(true);
                format.setShowMinute(true);
                format.setShowSecond(seconds);
                format.setHourPadding(true);
                format.setMinutePadding(true);
                if (seconds)
                    format.setSecondPadding(true);
                if (seconds && decimals >= 1)
                    showFraction(format, decimals);
                else
                    format.setShowMilliseconds(false);
                format.setHourFormat(CTFormatType::hourFormat_24);
                break;
            }
            case 22: {
                const bool seconds = width > 17;
                format.setBaseFormat(CTFormatType::baseFormat_dateTime);
                format.setShowYear(true);
                format.setShowMonth(true);
                format.setShowDay(true);
                format.setShowHour(true);
                format.setShowMinute(true);
                format.setShowSecond(seconds);
                if (seconds && decimals > 0)
                    showFraction(format, decimals);
                else
                    format.setShowMilliseconds(false);
                format.setDayPadding(true);
                format.setDayOfMonthPadding(true);
                format.setHourPadding(true);
                format.setMinutePadding(true);
                format.setDayType(CTFormatType::dayType_dayOfMonth);
                format.setMonthFormat(CTFormatType::monthFormat_short);
                format.setYearAbbreviation(false);
                format.setHourFormat(CTFormatType::hourFormat_24);
                format.setSeparators(u".,-:");
                format.setMdyOrder(CTFormatType::mdyOrder_1);
                break;
            }
            case 23:
                numericDate(format, width, u".,/:", CTFormatType::mdyOrder_3);
                break;
            case 38:
                numericDate(format, width, u".,.:", CTFormatType::mdyOrder_1);
                break;
            case 39:
                numericDate(format, width, u".,/:", CTFormatType::mdyOrder_6);
                break;
            case 24:
                format.setBaseFormat(CTFormatType::baseFormat_date);
                format.setShowYear(true);
                format.setShowDay(true);
                format.setShowMonth(false);
                format.setDayPadding(true);
                format.setDayOfMonthPadding(true);
                format.setHiddenSeparator(GrxUni::_true);
                format.setDayType(CTFormatType::dayType_dayOfYear);
                format.setYearAbbreviation(width < 6);
                format.setMdyOrder(CTFormatType::mdyOrder_6);
                break;
            case 26:
                format.setBaseFormat(CTFormatType::baseFormat_dateTime);
                format.setShowDayOfWeek(true);
                format.setShowDay(false);
                format.setShowMonth(false);
                format.setShowYear(false);
                noTimeOfDay(format);
                format.setDayPadding(false);
                format.setDayOfMonthPadding(false);
                format.setDayType(CTFormatType::dayType_dayOfMonth);
                format.setMonthFormat(CTFormatType::monthFormat_short);
                format.setDayOfWeekAbbreviation(width < 4);
                break;
            case 27:
                format.setBaseFormat(CTFormatType::baseFormat_dateTime);
                format.setShowMonth(true);
                format.setShowDay(false);
                format.setShowYear(false);
                noTimeOfDay(format);
                format.setDayPadding(false);
                format.setDayOfMonthPadding(false);
                format.setDayType(CTFormatType::dayType_dayOfMonth);
                format.setMonthFormat(width < 4 ? CTFormatType::monthFormat_long
                                                : CTFormatType::monthFormat_short);
                break;
            case 28:
                format.setBaseFormat(CTFormatType::baseFormat_dateTime);
                format.setShowYear(true);
                format.setShowMonth(true);
                format.setShowDay(false);
                noTimeOfDay(format);
                format.setMonthFormat(CTFormatType::monthFormat_short);
                format.setYearAbbreviation(width < 7);
                format.setSeparators(u"., :");
                format.setMdyOrder(CTFormatType::mdyOrder_3);
                break;
            case 29:
                format.setBaseFormat(CTFormatType::baseFormat_dateTime);
                format.setShowYear(true);
                format.setShowQuarter(true);
                format.setShowMonth(false);
                format.setShowDay(false);
                noTimeOfDay(format);
                format.setQuarterSuffix(u" Q ");
                format.setYearAbbreviation(width < 7);
                format.setSeparators(u"., :");
                break;
            case 30:
                format.setBaseFormat(CTFormatType::baseFormat_date);
                format.setShowWeek(true);
                format.setShowYear(true);
                format.setShowMonth(false);
                format.setShowDay(false);
                format.setWeekSuffix(u" WK ");
                format.setYearAbbreviation(width < 9);
                break;
            default:
                return false;
            }
            return true;
        },
        __LINE__);
}

bool ChartBase::FormatElapsedTime(GrxFormat& format, const Kovar_Format& hostFormat) {
    reported(
        [&] {
            const int decimals = hostFormat.GetDecimals();
            format.setBaseFormat(CTFormatType::baseFormat_elapsed);
            format.setShowDay(true);
            format.setShowSecond(true);
            format.setDayPadding(true);
            format.setHourPadding(true);
            format.setMinutePadding(true);
            format.setSecondPadding(true);
            format.setUseGrouping(hostGroupsDigits());
            if (decimals == 0)
                format.setShowMilliseconds(false);
            else
                showFraction(format, decimals);
            return true;
        },
        __LINE__);
    return true;
}

bool ChartBase::FormatCustomCurrency(GrxFormat& format, const Kovar_Format& hostFormat) {
    const int type = hostFormat.GetType();
    if (type < 33 || type > 37)
        return false;
    return reported(
        [&] {
            const kovar::customCurrency currency = kovar::currencyFormat().GetCCX(type - 33);
            const int decimals = hostFormat.GetDecimals();
            format.setMinimumFractionDigits(decimals);
            format.setMaximumFractionDigits(decimals);
            format.setUseGrouping(true);
            if (!currency.prefix.empty())
                format.setPrefix(hostText(currency.prefix));
            if (!currency.suffix.empty())
                format.setSuffix(hostText(currency.suffix));
            if (currency.negativePrefix == "-")
                format.setNegativesOutside(true);
            else if (!currency.negativePrefix.empty() || !currency.negativeSuffix.empty())
                format.setNegativesInParentheses(true);
            format.setSeparators(currency.decimalIndicator == "." ? u".,/:" : u",./:");
            return true;
        },
        __LINE__);
}

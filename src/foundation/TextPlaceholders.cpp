#include "foundation/TextPlaceholders.h"

#include "foundation/Report.h"

#include <plotaid/ChartBase.h>
#include <plotaid/ChartTranscoder.h>

#include <msgbook/FacSTDictionary.h>

#include <cstdio>
#include <memory>

namespace {
const char* const kFile = "backend/chartxml/plotaid/src/chartbase";
}

namespace plotaid::detail {

namespace {

const char* const kMonths[] = {"January", "February", "March",     "April",   "May",      "June",
                               "July",    "August",   "September", "October", "November", "December"};
const char* const kWeekdays[] = {"Sunday",   "Monday", "Tuesday", "Wednesday",
                                 "Thursday", "Friday", "Saturday"};

ChartString twoDigits(int value) {
    char buffer[16];
    std::snprintf(buffer, sizeof buffer, "%02d", value);
    return ChartString(buffer);
}

int twelveHour(int hour) {
    const int h = hour % 12;
    return h == 0 ? 12 : h;
}

// The dictionary's words, transcoded with one converter for the whole text.
class Words {
public:
    Words(const msgbook::FacSTDictionary* dictionary, const std::string& encoding)
        : dictionary_(dictionary), encoding_(encoding) {}

    // False when there is no word to put in: no dictionary, a key it lacks, text that does not
    // transcode.
    bool lookUp(const char* key, ChartString& word) {
        if (dictionary_ == nullptr)
            return false;
        unsigned long status = 0;
        const std::string host = dictionary_->LookUp(key, status);
        if (status != 0)
            return false;
        if (!transcoder_)
            transcoder_ = std::make_unique<ChartTranscoder>(encoding_);
        word = transcoder_->transcode(host);
        return host.empty() || !word.empty();
    }

private:
    const msgbook::FacSTDictionary* dictionary_;
    const std::string& encoding_;
    std::unique_ptr<ChartTranscoder> transcoder_;
};

void replace(ChartString& text, const char* placeholder, const ChartString& by) {
    text.replaceSubstring(ChartString(placeholder), by);
}

bool holds(const ChartString& text, const char* placeholder) {
    return text.ContainsString(ChartString(placeholder));
}

} // namespace

void updateTextAt(ChartString& text, const msgbook::FacSTDictionary* dictionary, const std::string& encoding,
                  const std::tm& now) {
    Words words(dictionary, encoding);
    const int year = now.tm_year + 1900;
    const bool afternoon = now.tm_hour >= 12;
    const char* const ampmKey = afternoon ? "p.m." : "a.m.";
    char buffer[64];
    ChartString word;

    if (holds(text, "@@current_date@@")) {
        std::snprintf(buffer, sizeof buffer, "%04d-%02d-%02d", year, now.tm_mon + 1, now.tm_mday);
        replace(text, "@@current_date@@", ChartString(buffer));
    }
    if (holds(text, ")DATE")) {
        std::snprintf(buffer, sizeof buffer, "%04d/%02d/%02d", year, now.tm_mon + 1, now.tm_mday);
        replace(text, ")DATE", ChartString(buffer));
    }
    if (holds(text, "@@current_time@@")) {
        std::snprintf(buffer, sizeof buffer, "%02d:%02d:%02d", twelveHour(now.tm_hour), now.tm_min,
                      now.tm_sec);
        replace(text, "@@current_time@@", ChartString(buffer));
    }
    if (holds(text, ")TIME") && words.lookUp(ampmKey, word)) {
        std::snprintf(buffer, sizeof buffer, "%d:%02d:%02d ", now.tm_hour, now.tm_min, now.tm_sec);
        replace(text, ")TIME", ChartString(buffer) + word);
    }
    if (holds(text, "@@current_YYYY@@")) {
        std::snprintf(buffer, sizeof buffer, "%04d", year);
        replace(text, "@@current_YYYY@@", ChartString(buffer));
    }
    if (holds(text, "@@current_YY@@"))
        replace(text, "@@current_YY@@", twoDigits((year % 100 + 100) % 100));
    if (holds(text, "@@current_month@@"))
        replace(text, "@@current_month@@", twoDigits(now.tm_mon + 1));
    if (holds(text, "@@current_day@@"))
        replace(text, "@@current_day@@", twoDigits(now.tm_mday));
    // A text that asks for the 24-hour hour keeps its 12-hour placeholder as written.
    const bool hour24 = holds(text, "@@current_hour24@@");
    if (hour24)
        replace(text, "@@current_hour24@@", twoDigits(now.tm_hour));
    if (!hour24 && holds(text, "@@current_hour@@"))
        replace(text, "@@current_hour@@", twoDigits(twelveHour(now.tm_hour)));
    if (holds(text, "@@current_min@@"))
        replace(text, "@@current_min@@", twoDigits(now.tm_min));
    if (holds(text, "@@current_sec@@"))
        replace(text, "@@current_sec@@", twoDigits(now.tm_sec));
    if (holds(text, "@@current_monthname@@") && now.tm_mon >= 0 && now.tm_mon < 12 &&
        words.lookUp(kMonths[now.tm_mon], word))
        replace(text, "@@current_monthname@@", word);
    if (holds(text, "@@current_ampm@@") && words.lookUp(ampmKey, word))
        replace(text, "@@current_ampm@@", word);
    if (holds(text, "@@current_weekday@@") && now.tm_wday >= 0 && now.tm_wday < 7 &&
        words.lookUp(kWeekdays[now.tm_wday], word))
        replace(text, "@@current_weekday@@", word);
}

} // namespace plotaid::detail

void ChartBase::updateText(ChartString& text, const msgbook::FacSTDictionary* dictionary,
                           const std::string& encoding) {
    plotaid::detail::guarded(kFile, __LINE__, "chart text placeholders could not be filled", [&] {
        const std::time_t clock = std::time(nullptr);
        std::tm now{};
        if (localtime_r(&clock, &now) == nullptr) {
            plotaid::detail::reportFailure("the local time is unknown", kFile, __LINE__);
            return;
        }
        plotaid::detail::updateTextAt(text, dictionary, encoding, now);
    });
}

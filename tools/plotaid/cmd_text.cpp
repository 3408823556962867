// plotaid text: a chart text with its date and time placeholders filled in for a language, so a
// template author can see what a title such as "Run of @@current_weekday@@" becomes.
#include "Command.h"

#include "templates/Localise.h"

#include <cstdio>
#include <ctime>
#include <string>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "text";

void printHelp() {
    std::printf("usage: plotaid text [--language CODE] [--at YYYY-MM-DDTHH:MM:SS] TEXT...\n\n"
                "Prints each TEXT on a line of its own with its placeholders filled in as a template\n"
                "fills them: @@current_date@@, )DATE, @@current_time@@, )TIME, @@current_YYYY@@,\n"
                "@@current_YY@@, @@current_month@@, @@current_day@@, @@current_hour24@@,\n"
                "@@current_hour@@, @@current_min@@, @@current_sec@@, @@current_monthname@@,\n"
                "@@current_ampm@@ and @@current_weekday@@.\n\n"
                "--language CODE  the words of the resource folder's messages for CODE (\"en\" when not\n"
                "                 given; a code without words of its own gets English ones)\n"
                "--at TIME        the moment to fill in instead of the local time now\n"
                "Exit status: 0 on success, 1 when the local time cannot be read, 2 on a usage error.\n");
}

// A calendar moment, strictly as YYYY-MM-DDTHH:MM:SS; the weekday follows from the date.
bool parseMoment(const std::string& text, std::tm& moment) {
    static const char kPattern[] = "dddd-dd-ddTdd:dd:dd";
    if (text.size() != sizeof kPattern - 1)
        return false;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool digit = text[i] >= '0' && text[i] <= '9';
        if (kPattern[i] == 'd' ? !digit : text[i] != kPattern[i])
            return false;
    }
    const auto number = [&](std::size_t at, std::size_t digits) {
        return std::stoi(text.substr(at, digits));
    };
    std::tm t{};
    t.tm_year = number(0, 4) - 1900;
    t.tm_mon = number(5, 2) - 1;
    t.tm_mday = number(8, 2);
    t.tm_hour = number(11, 2);
    t.tm_min = number(14, 2);
    t.tm_sec = number(17, 2);
    std::tm normal = t;
    timegm(&normal);
    // A day or an hour out of range rolls over; only a moment that stays as written is one.
    if (normal.tm_year != t.tm_year || normal.tm_mon != t.tm_mon || normal.tm_mday != t.tm_mday ||
        normal.tm_hour != t.tm_hour || normal.tm_min != t.tm_min || normal.tm_sec != t.tm_sec)
        return false;
    moment = normal;
    return true;
}

int run(const Args& args) {
    if (wantsHelp(args)) {
        printHelp();
        return kOk;
    }
    std::string language = "en";
    std::tm moment{};
    bool momentGiven = false;
    Args texts;
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& arg = args[i];
        if (arg == "--language" || arg == "--at") {
            if (i + 1 == args.size())
                return usageError(kName, arg + " needs a value");
            const std::string& value = args[++i];
            if (arg == "--language") {
                language = value;
            } else if (!parseMoment(value, moment)) {
                return usageError(kName, "'" + value + "' is not a moment YYYY-MM-DDTHH:MM:SS");
            } else {
                momentGiven = true;
            }
        } else if (arg.size() > 1 && arg[0] == '-' && arg[1] == '-') {
            return usageError(kName, "unknown option '" + arg + "'");
        } else {
            texts.push_back(arg);
        }
    }
    if (texts.empty())
        return usageError(kName, "no text given");
    if (!momentGiven) {
        const std::time_t now = std::time(nullptr);
        if (localtime_r(&now, &moment) == nullptr)
            return failure(kName, "the local time is unknown");
    }
    for (const std::string& text : texts) {
        ChartString filled(text);
        if (!detail::localiseChartTextFor(filled, language, moment))
            return usageError(kName, "'" + language + "' is not a language code");
        std::printf("%s\n", filled.toUTF8().c_str());
    }
    return kOk;
}

const Registrar registrar({kName, "chart text placeholders filled for a language and a moment", run});

} // namespace
} // namespace plotaid::tool

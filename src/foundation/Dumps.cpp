#include <plotaid/ChartBase.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace {
constexpr int kHighestKind = 9;
}

bool ChartBase::willPrintString(int kind) {
    if (std::getenv("DumpChartXMLPath") == nullptr)
        return false;
    const char* options = std::getenv("DumpChartXMLOptions");
    if (options == nullptr || kind < 0 || kind > kHighestKind)
        return false;
    // Kind 0 looks only at the first character, so an empty options text switches it on.
    if (kind == 0)
        return options[0] != '0';
    return std::strlen(options) > static_cast<std::size_t>(kind) && options[kind] != '0';
}

bool ChartBase::printString(const std::string& text, const std::string& name, const std::string& extension,
                            int count, int kind) {
    if (!willPrintString(kind) || text.empty())
        return false;
    try {
        char number[16];
        std::snprintf(number, sizeof number, "%02d", count);
        const std::string path =
            std::string(std::getenv("DumpChartXMLPath")) + "/" + name + number + extension;
        std::FILE* file = std::fopen(path.c_str(), "wb");
        if (file == nullptr)
            return false;
        const bool written = std::fwrite(text.data(), 1, text.size(), file) == text.size();
        return std::fclose(file) == 0 && written;
    } catch (...) {
        return false;
    }
}

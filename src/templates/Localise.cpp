#include "templates/Localise.h"

#include "foundation/TextPlaceholders.h"

#include <plotaid/ChartBase.h>
#include <plotaid/ChartTranscoder.h>

#include <msgbook/FacSTDictionary.h>
#include <scratchloc/PathFactory.h>

#include <utility>

namespace plotaid::detail {

namespace {

struct Localiser {
    msgbook::FacSTDictionary dictionary;
    std::string codePage;
};

Localiser localiserFor(const std::string& fullPath, const std::string& basePath) {
    Localiser l{msgbook::FacSTDictionary::overLanguageFolder(fullPath),
                codePageOf(languageCodeOf(fullPath, basePath))};
    l.dictionary.SetProcedure("GRAPH");
    return l;
}

const scratchloc::PathFinder* resourcePaths() {
    return scratchloc::PathFactory::getPathInstance(scratchloc::PathFactory::ResourceFolder);
}

} // namespace

std::string codePageOf(const std::string& languageCode) {
    static const std::pair<const char*, const char*> kCodePages[] = {
        {"ru", "CP1251"},   {"pl", "CP1250"}, {"zh_tw", "CP950"},
        {"zh-cn", "CP936"}, {"ko", "CP949"},  {"ja", "CP932"},
    };
    for (const auto& [code, page] : kCodePages) {
        if (languageCode == code)
            return page;
    }
    return "CP1252";
}

std::string languageCodeOf(const std::string& fullPath, const std::string& basePath) {
    if (fullPath.size() < basePath.size() || fullPath.compare(0, basePath.size(), basePath) != 0)
        return std::string();
    std::string::size_type start = basePath.size();
    if (start < fullPath.size() && fullPath[start] == '/')
        ++start;
    const std::string::size_type end = fullPath.find('/', start);
    return fullPath.substr(start, end == std::string::npos ? std::string::npos : end - start);
}

void localiseChartText(ChartString& text) {
    const scratchloc::PathFinder* paths = resourcePaths();
    if (paths == nullptr) {
        ChartBase::updateText(text, nullptr, codePageOf(std::string()));
        return;
    }
    const Localiser l = localiserFor(paths->getFullPath(), paths->getBasePath());
    ChartBase::updateText(text, &l.dictionary, l.codePage);
}

void localiseChartTextAt(ChartString& text, const std::string& fullPath, const std::string& basePath,
                         const std::tm& now) {
    const Localiser l = localiserFor(fullPath, basePath);
    updateTextAt(text, &l.dictionary, l.codePage, now);
}

bool localiseChartTextFor(ChartString& text, const std::string& language, const std::tm& now) {
    const scratchloc::PathFinder* paths = resourcePaths();
    if (paths == nullptr || !msgbook::isPlainName(language))
        return false;
    const std::string base = paths->getBasePath();
    localiseChartTextAt(text, base + language + "/", base, now);
    return true;
}

ChartString localisedWord(const std::string& key) {
    const scratchloc::PathFinder* paths = resourcePaths();
    if (paths == nullptr)
        return ChartString(key);
    const Localiser l = localiserFor(paths->getFullPath(), paths->getBasePath());
    unsigned long status = 0;
    const std::string host = l.dictionary.LookUp(key, status);
    if (status != 0)
        return ChartString(key);
    ChartString word = ChartTranscoder(l.codePage).transcode(host);
    return word.empty() ? ChartString(key) : word;
}

} // namespace plotaid::detail

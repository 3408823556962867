#include <msgbook/FacSTDictionary.h>

#include <fstream>
#include <utility>

namespace msgbook {

namespace {

std::string& languageSetting() {
    static std::string language = "en";
    return language;
}

const char* const kCommon = "common";
const char* const kEnglish = "en";
const char* const kMessages = "/messages/";

} // namespace

// Names become parts of a file name: anything that could leave the messages folder (or is not a
// plain word) names no table at all.
bool isPlainName(const std::string& name) {
    if (name.empty() || name.size() > 64)
        return false;
    for (char c : name) {
        const bool ok = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') ||
                        c == '_' || c == '-';
        if (!ok)
            return false;
    }
    return true;
}

void setHostLanguage(const std::string& language) {
    languageSetting() = language;
}
std::string hostLanguage() {
    return languageSetting();
}

FacSTDictionary::FacSTDictionary(std::string folder) : FacSTDictionary(std::move(folder), hostLanguage()) {}

FacSTDictionary::FacSTDictionary(std::string folder, std::string language)
    : folder_(std::move(folder)), language_(std::move(language)) {}

FacSTDictionary FacSTDictionary::overLanguageFolder(const std::string& path) {
    std::string folder = path;
    while (!folder.empty() && folder.back() == '/')
        folder.pop_back();
    const std::string::size_type slash = folder.find_last_of('/');
    if (slash == std::string::npos)
        return FacSTDictionary(std::string(), std::string());
    std::string language = folder.substr(slash + 1);
    folder.erase(slash + 1);
    const std::string messages(kMessages);
    if (folder.size() < messages.size() ||
        folder.compare(folder.size() - messages.size(), messages.size(), messages) != 0)
        return FacSTDictionary(std::string(), std::string());
    folder.erase(folder.size() - messages.size() + 1);
    return FacSTDictionary(std::move(folder), std::move(language));
}

void FacSTDictionary::SetProcedure(const std::string& procedure) {
    procedure_ = procedure;
}

const FacSTDictionary::Table& FacSTDictionary::table(const std::string& procedure,
                                                     const std::string& language) const {
    static const Table none;
    if (!isPlainName(procedure) || !isPlainName(language) || folder_.empty())
        return none;
    const std::string file = procedure + "." + language + ".txt";
    auto found = loaded_.find(file);
    if (found != loaded_.end())
        return found->second;

    Table& t = loaded_[file];
    std::ifstream in(folder_ + "messages/" + file, std::ios::binary);
    std::size_t total = 0;
    std::string line;
    while (in && total < kMaxFileBytes) {
        line.clear();
        // Read one line, keeping at most kMaxLineBytes of it.
        for (int c; (c = in.get()) != std::char_traits<char>::eof() && c != '\n';) {
            ++total;
            if (line.size() < kMaxLineBytes)
                line.push_back(static_cast<char>(c));
        }
        ++total;
        if (!line.empty() && line.back() == '\r')
            line.pop_back();
        if (line.empty() || line[0] == '#')
            continue;
        const std::size_t tab = line.find('\t');
        if (tab == std::string::npos || tab == 0)
            continue;
        // The first definition of a key wins.
        t.emplace(line.substr(0, tab), line.substr(tab + 1));
    }
    return t;
}

bool FacSTDictionary::find(const std::string& key, std::string& text) const {
    std::vector<std::string> procedures;
    if (!procedure_.empty() && procedure_ != kCommon)
        procedures.push_back(procedure_);
    procedures.push_back(kCommon);
    std::vector<std::string> languages{language_};
    if (language_ != kEnglish)
        languages.push_back(kEnglish);

    for (const std::string& procedure : procedures) {
        for (const std::string& language : languages) {
            const Table& t = table(procedure, language);
            auto it = t.find(key);
            if (it != t.end()) {
                text = it->second;
                return true;
            }
        }
    }
    return false;
}

std::string FacSTDictionary::LookUp(const std::string& key) const {
    std::string text;
    return find(key, text) ? text : key;
}

std::string FacSTDictionary::LookUp(const std::string& key, unsigned long& status) const {
    std::string text;
    if (find(key, text))
        return text;
    status = 1;
    return key;
}

} // namespace msgbook

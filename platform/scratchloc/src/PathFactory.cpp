#include <scratchloc/PathFactory.h>
#include <scratchloc/ResourceFolder.h>

#include <msgbook/FacSTDictionary.h>

#include <cstdlib>
#include <dlfcn.h>
#include <limits.h>
#include <link.h>
#include <sys/stat.h>
#include <unistd.h>

namespace scratchloc {

namespace {

bool isDirectory(const std::string& path) {
    struct stat st {};
    return ::stat(path.c_str(), &st) == 0 && S_ISDIR(st.st_mode);
}

std::string executablePath() {
    char buffer[PATH_MAX];
    const ssize_t n = ::readlink("/proc/self/exe", buffer, sizeof buffer - 1);
    return n > 0 ? std::string(buffer, static_cast<std::size_t>(n)) : std::string();
}

std::string parentOf(const std::string& path) {
    const std::string::size_type slash = path.find_last_of('/');
    if (slash == std::string::npos)
        return std::string();
    return slash == 0 ? std::string("/") : path.substr(0, slash);
}

// Read on every call: the host (and the tests) may point the library elsewhere at any time.
class ResourceFolderFinder final : public PathFinder {
public:
    std::string getPath() const override {
        if (const char* configured = std::getenv("PLOTAID_RESOURCE_DIR"); configured && *configured)
            return withTrailingSlash(configured);
        const std::string installed = installedResourceFolder(containingBinary());
        if (!installed.empty())
            return installed;
        return withTrailingSlash(PLOTAID_SOURCE_RESOURCE_DIR);
    }
    std::string getBasePath() const override { return getPath() + "messages/"; }
    // A host language that is no plain folder name would lead out of the folder: the base stands.
    std::string getFullPath() const override {
        const std::string language = msgbook::hostLanguage();
        return msgbook::isPlainName(language) ? getBasePath() + language + "/" : getBasePath();
    }
};

} // namespace

std::string withTrailingSlash(std::string folder) {
    while (folder.size() > 1 && folder[folder.size() - 1] == '/' && folder[folder.size() - 2] == '/')
        folder.pop_back();
    if (!folder.empty() && folder.back() != '/')
        folder += '/';
    return folder;
}

std::string containingBinary() {
    Dl_info info{};
    link_map* map = nullptr;
    void* self = reinterpret_cast<void*>(&containingBinary);
    if (::dladdr1(self, &info, reinterpret_cast<void**>(&map), RTLD_DL_LINKMAP) == 0 || map == nullptr)
        return executablePath();
    // The main program's link map carries no name; its file is /proc/self/exe.
    if (map->l_name == nullptr || map->l_name[0] == '\0')
        return executablePath();
    char resolved[PATH_MAX];
    if (::realpath(map->l_name, resolved) == nullptr)
        return map->l_name;
    return resolved;
}

std::string installedResourceFolder(const std::string& binaryPath) {
    // bin/ and lib/ sit one level below the prefix; a multiarch lib/<triplet>/ two levels.
    constexpr int kLevels = 2;
    std::string dir = parentOf(binaryPath);
    for (int level = 0; level < kLevels && !dir.empty() && dir != "/"; ++level) {
        dir = parentOf(dir);
        const std::string candidate = withTrailingSlash(dir) + PLOTAID_INSTALL_RESOURCE_SUBDIR;
        if (isDirectory(candidate))
            return withTrailingSlash(candidate);
    }
    return std::string();
}

const PathFinder* PathFactory::getPathInstance(int kind) {
    static const ResourceFolderFinder resourceFolder;
    return kind == ResourceFolder ? &resourceFolder : nullptr;
}

} // namespace scratchloc

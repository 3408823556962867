#ifndef PLOTAID_TESTS_FOUNDATION_SUPPORT_H
#define PLOTAID_TESTS_FOUNDATION_SUPPORT_H

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <optional>
#include <sstream>
#include <string>

#include <unistd.h>

namespace foundation_test {

// Sets (or, with nullopt, unsets) an environment variable and restores it on destruction.
class ScopedEnv {
public:
    ScopedEnv(const char* name, const std::optional<std::string>& value) : name_(name) {
        if (const char* old = std::getenv(name))
            old_ = old;
        if (value)
            ::setenv(name, value->c_str(), 1);
        else
            ::unsetenv(name);
    }
    ~ScopedEnv() {
        if (old_)
            ::setenv(name_.c_str(), old_->c_str(), 1);
        else
            ::unsetenv(name_.c_str());
    }
    ScopedEnv(const ScopedEnv&) = delete;
    ScopedEnv& operator=(const ScopedEnv&) = delete;

private:
    std::string name_;
    std::optional<std::string> old_;
};

// A fresh folder, removed with everything in it on destruction.
class TempDir {
public:
    TempDir() {
        std::string pattern = (std::filesystem::temp_directory_path() / "plotaid-foundation-XXXXXX").string();
        if (::mkdtemp(pattern.data()) != nullptr)
            path_ = pattern;
    }
    ~TempDir() {
        std::error_code ignored;
        if (!path_.empty())
            std::filesystem::remove_all(path_, ignored);
    }
    TempDir(const TempDir&) = delete;
    TempDir& operator=(const TempDir&) = delete;

    const std::string& path() const { return path_; }
    std::string file(const std::string& name) const { return path_ + "/" + name; }

private:
    std::string path_;
};

// The folder where the error log and the dumps go, switched on for the lifetime of the object.
class DumpFolder {
public:
    explicit DumpFolder(const std::optional<std::string>& options = std::nullopt)
        : path_("DumpChartXMLPath", dir_.path()), options_("DumpChartXMLOptions", options) {}

    const TempDir& dir() const { return dir_; }
    std::string log() const { return read(dir_.file("chartxml_error.log")); }
    bool hasLog() const { return std::filesystem::exists(dir_.file("chartxml_error.log")); }

    static std::string read(const std::string& file) {
        std::ifstream in(file, std::ios::binary);
        std::ostringstream text;
        text << in.rdbuf();
        return text.str();
    }

private:
    TempDir dir_;
    ScopedEnv path_;
    ScopedEnv options_;
};

// Works in another folder for the lifetime of the object.
class ScopedCwd {
public:
    explicit ScopedCwd(const std::string& folder) : old_(std::filesystem::current_path()) {
        std::filesystem::current_path(folder);
    }
    ~ScopedCwd() {
        std::error_code ignored;
        std::filesystem::current_path(old_, ignored);
    }
    ScopedCwd(const ScopedCwd&) = delete;
    ScopedCwd& operator=(const ScopedCwd&) = delete;

private:
    std::filesystem::path old_;
};

inline void writeFile(const std::string& path, const std::string& text) {
    std::ofstream out(path, std::ios::binary);
    out << text;
}

inline std::string testData(const std::string& name) {
    return std::string(PLOTAID_TEST_DATA_DIR) + "/foundation/" + name;
}

// Points the path service at the test resource folder.
class TestResources {
public:
    TestResources() : env_("PLOTAID_RESOURCE_DIR", testData("resources")) {}

private:
    ScopedEnv env_;
};

} // namespace foundation_test

#endif

#ifndef PLOTAID_TESTS_FOUNDATION_SUPPORT_H
#define PLOTAID_TESTS_FOUNDATION_SUPPORT_H

#include "support/EngineSupport.h"

#include <filesystem>
#include <optional>
#include <regex>
#include <string>

namespace foundation_test {

// The folder where the error log and the dumps go, switched on for the lifetime of the object.
class DumpFolder {
public:
    explicit DumpFolder(const std::optional<std::string>& options = std::nullopt)
        : path_("DumpChartXMLPath", dir_.path()), options_("DumpChartXMLOptions", options) {}

    const TempDir& dir() const { return dir_; }
    std::string log() const { return readAll(dir_.file("chartxml_error.log")); }
    bool hasLog() const { return std::filesystem::exists(dir_.file("chartxml_error.log")); }

private:
    TempDir dir_;
    ScopedEnv path_, options_;
};

// Works in another folder for the lifetime of the object.
struct ScopedCwd {
    explicit ScopedCwd(const std::string& folder) { std::filesystem::current_path(folder); }
    ~ScopedCwd() {
        std::error_code ignored;
        std::filesystem::current_path(old, ignored);
    }
    const std::filesystem::path old = std::filesystem::current_path();
};

inline std::string testData(const std::string& name) {
    return std::string(PLOTAID_TEST_DATA_DIR) + "/foundation/" + name;
}

// Points the path service at the test resource folder.
struct TestResources {
    ScopedEnv env{"PLOTAID_RESOURCE_DIR", testData("resources")};
};

inline std::string utf8(const XMLCh* text) {
    return ChartString(text).toUTF8();
}

inline std::string withoutSchemaLine(const std::string& text) {
    return std::regex_replace(text, std::regex(R"(\s+xsi:schemaLocation="[^"]*")"), "");
}

} // namespace foundation_test

#endif

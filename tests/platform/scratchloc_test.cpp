#include <scratchloc/PathFactory.h>
#include <scratchloc/ResourceFolder.h>

#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <unistd.h>

namespace fs = std::filesystem;
using scratchloc::PathFactory;

namespace {

// Sets or clears PLOTAID_RESOURCE_DIR for one test and puts the old value back.
class ResourceDirVariable {
public:
    ResourceDirVariable() {
        if (const char* old = std::getenv("PLOTAID_RESOURCE_DIR")) {
            had_ = true;
            old_ = old;
        }
    }
    ~ResourceDirVariable() {
        if (had_)
            ::setenv("PLOTAID_RESOURCE_DIR", old_.c_str(), 1);
        else
            ::unsetenv("PLOTAID_RESOURCE_DIR");
    }
    void set(const std::string& value) { ::setenv("PLOTAID_RESOURCE_DIR", value.c_str(), 1); }
    void clear() { ::unsetenv("PLOTAID_RESOURCE_DIR"); }

private:
    bool had_ = false;
    std::string old_;
};

class TempDir {
public:
    TempDir() {
        std::string pattern = (fs::temp_directory_path() / "scratchloc-XXXXXX").string();
        path_ = ::mkdtemp(&pattern[0]) ? pattern : std::string();
    }
    ~TempDir() {
        std::error_code ec;
        fs::remove_all(path_, ec);
    }
    const std::string& path() const { return path_; }

private:
    std::string path_;
};

void touch(const fs::path& file) {
    fs::create_directories(file.parent_path());
    std::ofstream(file) << "x";
}

std::string resourcePath() {
    const scratchloc::PathFinder* finder = PathFactory::getPathInstance(PathFactory::ResourceFolder);
    return finder ? finder->getPath() : "<no finder>";
}

} // namespace

TEST(ScratchlocPathFactory, ServesOnlyTheResourceFolder) {
    EXPECT_NE(PathFactory::getPathInstance(3), nullptr);
    EXPECT_EQ(PathFactory::getPathInstance(3), PathFactory::getPathInstance(3));
    EXPECT_EQ(PathFactory::getPathInstance(0), nullptr);
    EXPECT_EQ(PathFactory::getPathInstance(4), nullptr);
    EXPECT_EQ(PathFactory::getPathInstance(-1), nullptr);
}

TEST(ScratchlocPathFactory, EnvironmentVariableWinsAndIsReadEachCall) {
    ResourceDirVariable variable;
    variable.set("/opt/charts/res");
    EXPECT_EQ(resourcePath(), "/opt/charts/res/");
    variable.set("/elsewhere/");
    EXPECT_EQ(resourcePath(), "/elsewhere/");
    variable.set(""); // set but empty counts as unset
    EXPECT_EQ(resourcePath(), std::string(PLOTAID_SOURCE_DIR) + "/resources/");
}

TEST(ScratchlocPathFactory, BuildTreeFallsBackToSourceResources) {
    ResourceDirVariable variable;
    variable.clear();
    const std::string path = resourcePath();
    EXPECT_EQ(path, std::string(PLOTAID_SOURCE_DIR) + "/resources/");
    EXPECT_TRUE(fs::is_directory(path));
}

TEST(ScratchlocResourceFolder, ContainingBinaryIsThisProgram) {
    // The stand-in is linked statically into this test program.
    const std::string binary = scratchloc::containingBinary();
    ASSERT_FALSE(binary.empty());
    EXPECT_TRUE(fs::equivalent(binary, "/proc/self/exe"));
}

TEST(ScratchlocResourceFolder, FindsShareBesideBinOrLib) {
    TempDir prefix;
    ASSERT_FALSE(prefix.path().empty());
    const fs::path root = prefix.path();
    EXPECT_EQ(scratchloc::installedResourceFolder((root / "bin/plotaid").string()), "");
    fs::create_directories(root / "share/plotaid");
    const std::string expected = (root / "share/plotaid").string() + "/";
    EXPECT_EQ(scratchloc::installedResourceFolder((root / "bin/plotaid").string()), expected);
    EXPECT_EQ(scratchloc::installedResourceFolder((root / "lib/libplotaid.so.1").string()), expected);
    EXPECT_EQ(scratchloc::installedResourceFolder((root / "lib/x86_64-linux-gnu/libplotaid.so.1").string()),
              expected);
    // Deeper than a multiarch folder is not an installation layout.
    EXPECT_EQ(scratchloc::installedResourceFolder((root / "a/b/c/libplotaid.so").string()), "");
    EXPECT_EQ(scratchloc::installedResourceFolder(""), "");
}

TEST(ScratchlocResourceFolder, AFileNamedLikeTheFolderIsNotIt) {
    TempDir prefix;
    const fs::path root = prefix.path();
    touch(root / "share/plotaid");
    EXPECT_EQ(scratchloc::installedResourceFolder((root / "lib/libplotaid.so").string()), "");
}

TEST(ScratchlocResourceFolder, TrailingSlash) {
    EXPECT_EQ(scratchloc::withTrailingSlash("/a/b"), "/a/b/");
    EXPECT_EQ(scratchloc::withTrailingSlash("/a/b/"), "/a/b/");
    EXPECT_EQ(scratchloc::withTrailingSlash("/a/b//"), "/a/b/");
    EXPECT_EQ(scratchloc::withTrailingSlash("/"), "/");
    EXPECT_EQ(scratchloc::withTrailingSlash(""), "");
}

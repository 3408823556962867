#include "support/TestSupport.h"

#include <msgbook/FacSTDictionary.h>
#include <scratchloc/PathFactory.h>
#include <scratchloc/ResourceFolder.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <string>

namespace fs = std::filesystem;
using scratchloc::installedResourceFolder;
using scratchloc::PathFactory;

namespace {

std::string resourcePath() {
    const scratchloc::PathFinder* finder = PathFactory::getPathInstance(PathFactory::ResourceFolder);
    return finder ? finder->getPath() : "<no finder>";
}

TEST(ScratchlocPathFactory, ServesOnlyTheResourceFolderAndReadsTheVariableEachCall) {
    EXPECT_NE(PathFactory::getPathInstance(3), nullptr);
    EXPECT_EQ(PathFactory::getPathInstance(3), PathFactory::getPathInstance(3));
    for (int other : {0, 4, -1})
        EXPECT_EQ(PathFactory::getPathInstance(other), nullptr) << other;

    const std::string sourceResources = std::string(PLOTAID_SOURCE_DIR) + "/resources/";
    // Set but empty counts as unset: a build tree falls back to the source's resources.
    const std::pair<const char*, std::string> cases[] = {{"/opt/charts/res", "/opt/charts/res/"},
                                                         {"/elsewhere/", "/elsewhere/"},
                                                         {"", sourceResources},
                                                         {nullptr, sourceResources}};
    for (const auto& [value, path] : cases) {
        ScopedEnv variable("PLOTAID_RESOURCE_DIR", value);
        EXPECT_EQ(resourcePath(), path) << (value ? value : "unset");
    }
    EXPECT_TRUE(fs::is_directory(sourceResources));
}

// The language folders are a view of the messages folder, led by the host language.
TEST(ScratchlocPathFactory, LanguageFolderFollowsTheHostLanguage) {
    ScopedEnv variable("PLOTAID_RESOURCE_DIR", "/opt/res");
    const scratchloc::PathFinder& finder = *PathFactory::getPathInstance(PathFactory::ResourceFolder);
    const std::string before = msgbook::hostLanguage();
    const std::pair<const char*, const char*> cases[] = {{"de", "/opt/res/messages/de/"},
                                                         {"zh_tw", "/opt/res/messages/zh_tw/"},
                                                         {"../x", "/opt/res/messages/"}};
    for (const auto& [language, full] : cases) {
        msgbook::setHostLanguage(language);
        EXPECT_EQ(finder.getFullPath(), full) << language;
    }
    msgbook::setHostLanguage(before);
    EXPECT_EQ(finder.getBasePath(), "/opt/res/messages/");
    EXPECT_EQ(finder.getPath(), "/opt/res/");
}

TEST(ScratchlocResourceFolder, FindsShareBesideBinOrLibOfThisProgram) {
    // The stand-in is linked statically into this test program.
    const std::string binary = scratchloc::containingBinary();
    ASSERT_FALSE(binary.empty());
    EXPECT_TRUE(fs::equivalent(binary, "/proc/self/exe"));

    TempDir prefix;
    ASSERT_FALSE(prefix.path().empty());
    const fs::path root = prefix.path();
    // A file named like the folder is not it.
    fs::create_directories(root / "share");
    std::ofstream(root / "share/plotaid") << "x";
    EXPECT_EQ(installedResourceFolder((root / "bin/plotaid").string()), "");
    fs::remove(root / "share/plotaid");
    EXPECT_EQ(installedResourceFolder((root / "bin/plotaid").string()), "");

    fs::create_directories(root / "share/plotaid");
    const std::string expected = (root / "share/plotaid").string() + "/";
    for (const char* binaryPath :
         {"bin/plotaid", "lib/libplotaid.so.1", "lib/x86_64-linux-gnu/libplotaid.so.1"})
        EXPECT_EQ(installedResourceFolder((root / binaryPath).string()), expected) << binaryPath;
    // Deeper than a multiarch folder is not an installation layout.
    EXPECT_EQ(installedResourceFolder((root / "a/b/c/libplotaid.so").string()), "");
    EXPECT_EQ(installedResourceFolder(""), "");
}

TEST(ScratchlocResourceFolder, TrailingSlash) {
    const std::pair<const char*, const char*> cases[] = {
        {"/a/b", "/a/b/"}, {"/a/b/", "/a/b/"}, {"/a/b//", "/a/b/"}, {"/", "/"}, {"", ""}};
    for (const auto& [path, expected] : cases)
        EXPECT_EQ(scratchloc::withTrailingSlash(path), expected) << path;
}

} // namespace

#include "support/TestSupport.h"

#include <msgbook/FacSTDictionary.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>

namespace {

class Messages : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_FALSE(dir.path().empty());
        std::filesystem::create_directory(folder + "messages");
    }
    void write(const std::string& file, const std::string& content) {
        std::ofstream(folder + "messages/" + file, std::ios::binary) << content;
    }
    TempDir dir;
    std::string folder = dir.path() + "/";
};

} // namespace

TEST_F(Messages, KeyTabTextLinesUnknownKeysGiveTheKey) {
    write("common.en.txt",
          "# comment\tignored\nE1\tFirst text\r\n\nno tab here\n\tno key\nE2\ttext\twith tab\n"
          "E1\tsecond definition\nspaced key \t value kept as is \n");
    const msgbook::FacSTDictionary d(folder, "en");
    unsigned long status = 0;
    EXPECT_EQ(d.LookUp("E1", status), "First text");
    EXPECT_EQ(status, 0u);
    EXPECT_EQ(d.LookUp("E2"), "text\twith tab");
    EXPECT_EQ(d.LookUp("spaced key "), " value kept as is ");
    EXPECT_EQ(d.LookUp(""), ""); // a line without a key defines nothing
    EXPECT_EQ(d.LookUp("# comment", status), "# comment");
    EXPECT_EQ(status, 1u);
}

TEST_F(Messages, ProcedureTableFirstThenCommonEachLanguageBeforeEnglish) {
    write("common.en.txt", "a\tcommon en\nb\tcommon en\nc\tcommon en\nd\tcommon en\nk\tenglish\n");
    write("common.de.txt", "a\tcommon de\nb\tcommon de\nc\tcommon de\n");
    write("GRAPH.en.txt", "a\tgraph en\nb\tgraph en\n");
    write("GRAPH.de.txt", "a\tgraph de\n");
    write("common.ja.txt", "k\tjapanese\n");
    msgbook::FacSTDictionary d(folder, "de");
    EXPECT_EQ(d.LookUp("a"), "common de");
    d.SetProcedure("GRAPH");
    EXPECT_EQ(d.GetProcedure(), "GRAPH");
    EXPECT_EQ(d.LookUp("a"), "graph de");
    EXPECT_EQ(d.LookUp("b"), "graph en");
    EXPECT_EQ(d.LookUp("c"), "common de");
    EXPECT_EQ(d.LookUp("d"), "common en");
    msgbook::FacSTDictionary fr(folder, "fr"); // no files: English
    fr.SetProcedure("GRAPH");
    EXPECT_EQ(fr.LookUp("a"), "graph en");

    // The host language is the default of new dictionaries.
    const std::string before = msgbook::hostLanguage();
    msgbook::setHostLanguage("ja");
    const msgbook::FacSTDictionary ja(folder);
    msgbook::setHostLanguage(before);
    EXPECT_EQ(ja.GetLanguage(), "ja");
    EXPECT_EQ(ja.LookUp("k"), "japanese");
}

TEST_F(Messages, NamesThatCouldLeaveTheFolderReadNothing) {
    std::ofstream(folder + "secret.en.txt") << "k\tleaked\n";
    std::ofstream(folder + "common.en.txt") << "k\tleaked\n";
    write("common.en.txt", "");
    for (const char* procedure : {"../secret", "..", "/etc/passwd", "a/b", "x y"}) {
        msgbook::FacSTDictionary d(folder, "en");
        d.SetProcedure(procedure);
        EXPECT_EQ(d.LookUp("k"), "k") << procedure;
    }
    for (const char* language : {"../../en", "en/..", ""})
        EXPECT_EQ(msgbook::FacSTDictionary(folder, language).LookUp("k"), "k") << language;
    EXPECT_EQ(msgbook::FacSTDictionary("", "en").LookUp("k"), "k");
}

TEST_F(Messages, OverALanguageFolderOfTheMessagesFolder) {
    write("GRAPH.de.txt", "k\tde word\n");
    const std::pair<std::string, const char*> cases[] = {
        {folder + "messages/de/", "de word"}, {folder + "messages/de", "de word"}, {folder + "de/", "k"},
        {folder + "messages/../de/", "k"},    {folder + "messages/", "k"},         {"de", "k"},
    };
    for (const auto& [path, word] : cases) {
        msgbook::FacSTDictionary d = msgbook::FacSTDictionary::overLanguageFolder(path);
        d.SetProcedure("GRAPH");
        EXPECT_EQ(d.LookUp("k"), word) << path;
    }
}

TEST_F(Messages, OverlongLinesAndFilesAreCutNotLoadedWhole) {
    const std::string longText(msgbook::FacSTDictionary::kMaxLineBytes + 100, 'x');
    std::string big;
    while (big.size() < msgbook::FacSTDictionary::kMaxFileBytes)
        big += "filler\t0123456789\n";
    write("common.en.txt", "long\t" + longText + "\nafter\tyes\n");
    write("GRAPH.en.txt", big + "late\tunreachable\n");
    msgbook::FacSTDictionary d(folder, "en");
    EXPECT_EQ(d.LookUp("long").size(), msgbook::FacSTDictionary::kMaxLineBytes - 5);
    EXPECT_EQ(d.LookUp("after"), "yes");
    d.SetProcedure("GRAPH");
    EXPECT_EQ(d.LookUp("filler"), "0123456789");
    EXPECT_EQ(d.LookUp("late"), "late");
}

TEST(MessagesShipped, SourceTreeHasTheMessagesTheLibraryAsksFor) {
    msgbook::FacSTDictionary d(std::string(PLOTAID_SOURCE_DIR) + "/resources/", "en");
    unsigned long status = 0;
    EXPECT_EQ(d.LookUp("E60712", status), "Missing");
    d.SetProcedure("GRAPH");
    for (const char* key :
         {"January", "December", "Sunday", "Saturday", "a.m.", "p.m.", "histoMean", "histoStdDev", "histoN",
          "days", "Scale", "Fit line for ", "Total", "E60551", "E62224", "E62228"})
        d.LookUp(key, status);
    EXPECT_EQ(status, 0u);
}

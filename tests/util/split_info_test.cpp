#include "support/TestSupport.h"

#include <feed/memory.h>
#include <kovar/KovarGoToCaller.h>
#include <kovar/kovarconv.h>
#include <msgbook/FacSTDictionary.h>
#include <plotaid/splitInfo.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <memory>
#include <stdexcept>

namespace {

// A resource folder whose blank-value message is known, so the tests do not depend on the
// shipped wording.
class SplitInfo : public ::testing::Test {
protected:
    SplitInfo() {
        std::filesystem::create_directories(dir.path() + "/messages");
        std::ofstream(dir.path() + "/messages/common.en.txt") << "E60712\t<blank>\n";
        region = source.addVariable("region", "Sales region", Kovar_Format(5, 8, 0));
        city = source.addVariable("city", "", Kovar_Format(1, 12, 0));
        amount = source.addVariable("amount", "Amount paid", Kovar_Format(5, 8, 2));
        source.setSplitVariables({region, city});
    }

    TempDir dir;
    ScopedEnv resources{"PLOTAID_RESOURCE_DIR", dir.path().c_str()};
    feed::MemoryDataSource source;
    feed::MemoryCase cases;
    int region = 0, city = 0, amount = 0;
};

} // namespace

TEST_F(SplitInfo, LabelAndHeadingOfTheLatestCase) {
    feed::BpProcedure graph("GRAPH");
    splitInfo info;
    EXPECT_EQ(info.getSplitLabel(true), "");
    EXPECT_EQ(info.activateSplit(graph), nullptr); // before any saveSplitInfo
    source.variable(region).valueLabels().add(2.0, "North");
    cases.setNumber(region, 1.0);
    cases.setText(city, "A");
    info.saveSplitInfo(&cases, &source);
    cases.setNumber(region, 2.0);
    cases.setText(city, "Oslo");
    EXPECT_TRUE(info.saveSplitInfo(&cases, &source));
    EXPECT_EQ(info.getSplitLabel(true), "region = North, city = Oslo");
    // Without a label of its own, the variable shows its name.
    EXPECT_EQ(info.getSplitLabel(false), "Sales region = North, city = Oslo");

    std::unique_ptr<feed::BpHeading> heading(info.activateSplit(graph));
    ASSERT_NE(heading, nullptr);
    EXPECT_EQ(heading->Procedure(), "GRAPH");
    EXPECT_EQ(heading->Pattern(), "[%1 = %2:, ^1 = ^2:]1"); // the host lays the heading out by it
    EXPECT_EQ(heading->Text(), "Sales region = North, city = Oslo");
    source.suppressSplitHeading("FREQUENCIES");
    feed::BpProcedure frequencies("FREQUENCIES");
    EXPECT_EQ(info.activateSplit(frequencies), nullptr);

    // A null source keeps the entries but gives no heading.
    EXPECT_TRUE(info.saveSplitInfo(&cases, nullptr));
    EXPECT_EQ(info.getSplitLabel(true), "region = North, city = Oslo");
    EXPECT_EQ(info.activateSplit(graph), nullptr);

    // Split variables that cannot be read are skipped; amount has no value in the case.
    source.setSplitVariables({region, 99, -1, city, amount});
    EXPECT_TRUE(info.saveSplitInfo(&cases, &source));
    EXPECT_EQ(info.getSplitLabel(true), "region = North, city = Oslo");
    EXPECT_TRUE(info.saveSplitInfo(nullptr, &source));
    EXPECT_EQ(info.getSplitLabel(true), "");
}

TEST_F(SplitInfo, ValueTexts) {
    source.setSplitVariables({amount, city});
    source.variable(amount).addMissingValue(-9.0);
    splitInfo info;
    const auto label = [&](double number, const std::string& text) {
        cases.setNumber(amount, number);
        cases.setText(city, text);
        info.saveSplitInfo(&cases, &source);
        return info.getSplitLabel(true);
    };
    // Numbers printed, blanks trimmed; texts cut to the width, trailing blanks removed, leading kept.
    EXPECT_EQ(label(1234.5, "  Rio de Janeiro"), "amount = 1234.50, city =   Rio de Jan");
    // System-missing, user-missing and blank texts read as the blank-value message.
    EXPECT_EQ(label(kovar::kMissingValue, "    "), "amount = <blank>, city = <blank>");
    EXPECT_EQ(label(-9.0, ""), "amount = <blank>, city = <blank>");
    // Value labels win over the missing-value text.
    source.variable(amount).valueLabels().add(-9.0, "Refused");
    source.variable(city).valueLabels().add("  Rio de Jan", "Rio");
    EXPECT_EQ(label(-9.0, "  Rio de Janeiro"), "amount = Refused, city = Rio");

    // A text shorter in the case than its width is read only as far as it goes; type 2 is text too.
    const int wide = source.addVariable("note", "", Kovar_Format(1, 200, 0));
    const int code = source.addVariable("code", "", Kovar_Format(2, 4, 0));
    source.setSplitVariables({wide, code});
    cases.setText(wide, "short");
    cases.setText(code, "AB12");
    info.saveSplitInfo(&cases, &source);
    EXPECT_EQ(info.getSplitLabel(true), "note = short, code = AB12");
}

namespace {
// A variable whose host implementation fails, or unwinds to the host's caller.
class ThrowingVariable final : public feed::Kovar_Variable {
public:
    bool unwind = false;
    std::string GetName() const override {
        if (unwind)
            throw KovarGoToCaller(3);
        throw std::runtime_error("host failure");
    }
    std::string GetLabel() const override { return ""; }
    Kovar_Format GetFormat() const override { return Kovar_Format(5, 8, 0); }
    const feed::Kovar_ValueLabelMap* GetValueLabels() const override { return nullptr; }
    int IsMissing(double) const override { return 0; }
};

class PartlyFailingSource final : public feed::ProcedureDataSource {
public:
    explicit PartlyFailingSource(const feed::MemoryDataSource& inner) : inner_(inner) {}
    void unwindInstead() { broken_.unwind = true; }
    int GetVariableCount() const override { return inner_.GetVariableCount() + 1; }
    const feed::Kovar_Variable* GetVariable(int index) const override {
        return index == 7 ? &broken_ : inner_.GetVariable(index);
    }
    int GetSplitVariableCount() const override { return 2; }
    int GetSplitVariableIndex(int i) const override { return i == 0 ? 7 : 0; }
    bool UsesSplitHeading(const feed::BpProcedure&) const override { return true; }

private:
    const feed::MemoryDataSource& inner_;
    ThrowingVariable broken_;
};
} // namespace

TEST_F(SplitInfo, HostFailureCostsOnlyThatVariableUnwindingPassesThrough) {
    PartlyFailingSource failing(source);
    cases.setNumber(7, 1.0);
    cases.setNumber(region, 3.0);
    splitInfo info;
    EXPECT_TRUE(info.saveSplitInfo(&cases, &failing));
    EXPECT_EQ(info.getSplitLabel(true), "region = 3");

    failing.unwindInstead();
    try {
        info.saveSplitInfo(&cases, &failing);
        ADD_FAILURE() << "the host's unwinding was swallowed";
    } catch (const KovarGoToCaller& e) {
        EXPECT_EQ(e.code(), 3);
    }
}

TEST_F(SplitInfo, BlankMessageInTheHostLanguageWithEnglishFallback) {
    std::ofstream(dir.path() + "/messages/common.de.txt") << "E60712\tfehlt\n";
    source.setSplitVariables({city});
    cases.setText(city, "");
    const std::string before = msgbook::hostLanguage();
    msgbook::setHostLanguage("de");
    splitInfo german;
    msgbook::setHostLanguage("fr");
    splitInfo french;
    msgbook::setHostLanguage(before);
    german.saveSplitInfo(&cases, &source);
    french.saveSplitInfo(&cases, &source);
    EXPECT_EQ(german.getSplitLabel(true), "city = fehlt");
    EXPECT_EQ(french.getSplitLabel(true), "city = <blank>");
}

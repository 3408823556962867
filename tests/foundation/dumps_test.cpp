#include "foundation/FoundationSupport.h"

#include <plotaid/ChartBase.h>

#include <gtest/gtest.h>

using namespace foundation_test;

namespace {

std::vector<int> kindsOn() {
    std::vector<int> on;
    for (int kind = -1; kind <= 12; ++kind)
        if (ChartBase::willPrintString(kind))
            on.push_back(kind);
    return on;
}

TEST(DumpSwitches, OptionsCharactersSwitchKinds) {
    DumpFolder dumps("0000110001");
    EXPECT_EQ(kindsOn(), (std::vector<int>{4, 5, 9}));
    ScopedEnv all("DumpChartXMLOptions", std::string("11111111111111"));
    EXPECT_EQ(kindsOn(), (std::vector<int>{0, 1, 2, 3, 4, 5, 6, 7, 8, 9}));
    ScopedEnv letters("DumpChartXMLOptions", std::string("x0y"));
    EXPECT_EQ(kindsOn(), (std::vector<int>{0, 2}));
}

TEST(DumpSwitches, KindZeroLooksOnlyAtTheFirstCharacter) {
    DumpFolder dumps("1");
    EXPECT_EQ(kindsOn(), (std::vector<int>{0}));
    ScopedEnv empty("DumpChartXMLOptions", std::string());
    EXPECT_EQ(kindsOn(), (std::vector<int>{0}));
    ScopedEnv zero("DumpChartXMLOptions", std::string("01"));
    EXPECT_EQ(kindsOn(), (std::vector<int>{1}));
}

TEST(DumpSwitches, AllOffWithoutEitherVariable) {
    {
        DumpFolder dumps(std::nullopt);
        EXPECT_TRUE(kindsOn().empty());
        EXPECT_FALSE(ChartBase::printString("text", "Template_", ".sgt", 1, 0));
    }
    ScopedEnv noPath("DumpChartXMLPath", std::nullopt);
    ScopedEnv options("DumpChartXMLOptions", std::string("1111111111"));
    EXPECT_TRUE(kindsOn().empty());
    EXPECT_FALSE(ChartBase::printString("text", "Template_", ".sgt", 1, 4));
}

TEST(DumpSwitches, KindTenIsNeverOn) {
    DumpFolder dumps("1111111111111111");
    EXPECT_FALSE(ChartBase::willPrintString(10));
    EXPECT_FALSE(ChartBase::printString("text", "x", ".xml", 1, 10));
    EXPECT_TRUE(std::filesystem::is_empty(dumps.dir().path()));
}

TEST(DumpFiles, NameIsPathNameTwoDigitCountAndExtension) {
    DumpFolder dumps("0000111001");
    EXPECT_TRUE(ChartBase::printString("<before/>", "Xml_before_template_", ".xml", 7,
                                       ChartBase::PRINT_XML_BEFORE_TEMPLATE));
    EXPECT_TRUE(ChartBase::printString("tmpl", "Template_", ".sgt", 123, ChartBase::PRINT_TEMPLATE));
    EXPECT_TRUE(ChartBase::printString("<bad", "parseError_", ".xml", 0, ChartBase::PRINT_XML_WITH_POPUPS));
    EXPECT_TRUE(ChartBase::printString("<after/>", "Xml_after_template_", ".xml", 1,
                                       ChartBase::PRINT_XML_AFTER_TEMPLATE));
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(dumps.dir().path()))
        names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    EXPECT_EQ(names, (std::vector<std::string>{"Template_123.sgt", "Xml_after_template_01.xml",
                                               "Xml_before_template_07.xml", "parseError_00.xml"}));
    EXPECT_EQ(DumpFolder::read(dumps.dir().file("Xml_before_template_07.xml")), "<before/>");
}

TEST(DumpFiles, WritesBytesExactlyAndReplacesEarlierFile) {
    DumpFolder dumps("0001");
    const std::string binary("line\r\nzero\0byte\xff\n", 17);
    ASSERT_TRUE(ChartBase::printString(binary, "template_converted_", ".sgt", 2,
                                       ChartBase::PRINT_CONVERTED_TEMPLATE));
    EXPECT_EQ(DumpFolder::read(dumps.dir().file("template_converted_02.sgt")), binary);
    ASSERT_TRUE(ChartBase::printString("short", "template_converted_", ".sgt", 2,
                                       ChartBase::PRINT_CONVERTED_TEMPLATE));
    EXPECT_EQ(DumpFolder::read(dumps.dir().file("template_converted_02.sgt")), "short");
}

TEST(DumpFiles, FalseWhenNothingIsWritten) {
    DumpFolder dumps("1111111111");
    EXPECT_FALSE(ChartBase::printString("", "Template_", ".sgt", 1, 4));
    EXPECT_FALSE(std::filesystem::exists(dumps.dir().file("Template_01.sgt")));
    ScopedEnv missing("DumpChartXMLPath", dumps.dir().file("missing"));
    EXPECT_FALSE(ChartBase::printString("text", "Template_", ".sgt", 1, 4));
}

} // namespace

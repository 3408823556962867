#include "foundation/FoundationSupport.h"

#include <plotaid/ChartBase.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

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
    // Kind 0 looks only at the first character and is on when the options are empty; 10 is never on.
    const std::pair<const char*, std::vector<int>> cases[] = {
        {"0000110001", {4, 5, 9}},
        {"11111111111111", {0, 1, 2, 3, 4, 5, 6, 7, 8, 9}},
        {"x0y", {0, 2}},
        {"1", {0}},
        {"", {0}},
        {"01", {1}},
    };
    DumpFolder dumps;
    for (const auto& [options, kinds] : cases) {
        ScopedEnv set("DumpChartXMLOptions", options);
        EXPECT_EQ(kindsOn(), kinds) << options;
    }
    // All off without either variable.
    {
        ScopedEnv noOptions("DumpChartXMLOptions", nullptr);
        EXPECT_TRUE(kindsOn().empty());
        EXPECT_FALSE(ChartBase::printString("text", "Template_", ".sgt", 1, 0));
    }
    ScopedEnv noPath("DumpChartXMLPath", nullptr);
    ScopedEnv options("DumpChartXMLOptions", "1111111111");
    EXPECT_TRUE(kindsOn().empty());
    EXPECT_FALSE(ChartBase::printString("text", "Template_", ".sgt", 1, 4));
}

TEST(DumpFiles, NamedPathNameTwoDigitCountAndExtensionWithTheBytesExactly) {
    DumpFolder dumps("11111111111111");
    EXPECT_TRUE(ChartBase::printString("<before/>", "Xml_before_template_", ".xml", 7,
                                       ChartBase::PRINT_XML_BEFORE_TEMPLATE));
    EXPECT_TRUE(ChartBase::printString("tmpl", "Template_", ".sgt", 123, ChartBase::PRINT_TEMPLATE));
    EXPECT_TRUE(ChartBase::printString("<bad", "parseError_", ".xml", 0, ChartBase::PRINT_XML_WITH_POPUPS));
    const std::string binary("line\r\nzero\0byte\xff\n", 17);
    EXPECT_TRUE(ChartBase::printString("a longer text, written first", "converted_", ".sgt", 2,
                                       ChartBase::PRINT_CONVERTED_TEMPLATE));
    EXPECT_TRUE(ChartBase::printString(binary, "converted_", ".sgt", 2, ChartBase::PRINT_CONVERTED_TEMPLATE));
    // Nothing to write, or kind 10, or a missing folder: no file and false.
    EXPECT_FALSE(ChartBase::printString("", "Template_", ".sgt", 1, 4));
    EXPECT_FALSE(ChartBase::printString("text", "x", ".xml", 1, 10));
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(dumps.dir().path()))
        names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    EXPECT_EQ(names, (std::vector<std::string>{"Template_123.sgt", "Xml_before_template_07.xml",
                                               "converted_02.sgt", "parseError_00.xml"}));
    EXPECT_EQ(readAll(dumps.dir().file("Xml_before_template_07.xml")), "<before/>");
    EXPECT_EQ(readAll(dumps.dir().file("converted_02.sgt")), binary);
    ScopedEnv missing("DumpChartXMLPath", dumps.dir().file("missing"));
    EXPECT_FALSE(ChartBase::printString("text", "Template_", ".sgt", 1, 4));
}

} // namespace

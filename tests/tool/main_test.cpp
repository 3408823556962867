#include "support/ToolRunner.h"

#include <gtest/gtest.h>

TEST(Tool, VersionHelpAndUnknownCommand) {
    const ToolResult version = runTool("--version");
    EXPECT_EQ(version.exitCode, 0);
    EXPECT_NE(version.output.find("plotaid "), std::string::npos);
    const ToolResult help = runTool("--help");
    EXPECT_EQ(help.exitCode, 0);
    EXPECT_NE(help.output.find("usage: plotaid"), std::string::npos);
    EXPECT_EQ(runTool("").exitCode, 2);
    const ToolResult unknown = runTool("frobnicate");
    EXPECT_EQ(unknown.exitCode, 2);
    EXPECT_NE(unknown.output.find("unknown command 'frobnicate'"), std::string::npos);
}

#ifndef PLOTAID_TESTS_TOOLRUNNER_H
#define PLOTAID_TESTS_TOOLRUNNER_H

#include <string>

// Runs the command-line tool with a shell argument string; captures stdout+stderr and the exit code.
struct ToolResult {
    int exitCode = -1;
    std::string output;
};

ToolResult runTool(const std::string& args);

#endif

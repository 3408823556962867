#ifndef PLOTAID_TESTS_SUPPORT_TOOLRUNNER_H
#define PLOTAID_TESTS_SUPPORT_TOOLRUNNER_H

#include <gtest/gtest.h>

#include <array>
#include <cstdio>
#include <string>
#include <vector>

#include <sys/wait.h>

struct ToolResult {
    int exitCode = -1;
    std::string output;
};

// Runs a shell command line; captures its stdout (route stderr yourself) and the exit code.
inline ToolResult runCommand(const std::string& command) {
    ToolResult r;
    FILE* p = popen(command.c_str(), "r");
    if (!p)
        return r;
    std::array<char, 4096> buf;
    for (size_t n; (n = fread(buf.data(), 1, buf.size(), p)) > 0;)
        r.output.append(buf.data(), n);
    const int status = pclose(p);
    r.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    return r;
}

inline bool outputHas(const ToolResult& r, const std::string& text) {
    return r.output.find(text) != std::string::npos;
}

#ifdef PLOTAID_TOOL_PATH
// Runs the command-line tool with a shell argument string; stdout and stderr together.
inline ToolResult runTool(const std::string& args) {
    return runCommand(std::string("'") + PLOTAID_TOOL_PATH + "' " + args + " 2>&1");
}

// One run of the tool: the arguments after a common prefix, the exit code and texts of the output.
struct ToolRun {
    std::string args;
    int exitCode;
    std::vector<std::string> texts;
};

// Runs each in turn (later runs may read what earlier ones wrote).
inline void expectToolRuns(const std::string& prefix, const std::vector<ToolRun>& runs) {
    for (const ToolRun& run : runs) {
        SCOPED_TRACE(prefix + run.args);
        const ToolResult r = runTool(prefix + run.args);
        EXPECT_EQ(r.exitCode, run.exitCode) << r.output;
        for (const std::string& text : run.texts)
            EXPECT_TRUE(outputHas(r, text)) << "no \"" << text << "\" in\n" << r.output;
    }
}
#endif

#endif

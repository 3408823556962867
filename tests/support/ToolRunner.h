#ifndef PLOTAID_TESTS_SUPPORT_TOOLRUNNER_H
#define PLOTAID_TESTS_SUPPORT_TOOLRUNNER_H

#include <array>
#include <cstdio>
#include <string>

#include <sys/wait.h>

// Runs the command-line tool with a shell argument string; captures stdout+stderr and the exit code.
struct ToolResult {
    int exitCode = -1;
    std::string output;
};

inline ToolResult runTool(const std::string& args) {
    ToolResult r;
    const std::string cmd = std::string("'") + PLOTAID_TOOL_PATH + "' " + args + " 2>&1";
    FILE* p = popen(cmd.c_str(), "r");
    if (!p)
        return r;
    std::array<char, 4096> buf;
    size_t n;
    while ((n = fread(buf.data(), 1, buf.size(), p)) > 0)
        r.output.append(buf.data(), n);
    const int status = pclose(p);
    r.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    return r;
}

#endif

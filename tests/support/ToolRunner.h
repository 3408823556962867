#ifndef PLOTAID_TESTS_SUPPORT_TOOLRUNNER_H
#define PLOTAID_TESTS_SUPPORT_TOOLRUNNER_H

#include <array>
#include <cstdio>
#include <string>

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

#ifdef PLOTAID_TOOL_PATH
// Runs the command-line tool with a shell argument string; stdout and stderr together.
inline ToolResult runTool(const std::string& args) {
    return runCommand(std::string("'") + PLOTAID_TOOL_PATH + "' " + args + " 2>&1");
}
#endif

#endif

#ifndef PLOTAID_TOOL_COMMAND_H
#define PLOTAID_TOOL_COMMAND_H

#include <cstddef>
#include <string>
#include <vector>

namespace plotaid::tool {

using Args = std::vector<std::string>;

// A subcommand registers itself from its own source file with a static Registrar, so adding one
// touches no other file.
struct Command {
    const char* name;
    const char* summary;
    int (*run)(const Args& args); // args exclude the subcommand's own name
};

struct Registrar {
    explicit Registrar(const Command& command);
};

const std::vector<Command>& commands();

// Exit codes: 0 success, 1 the operation failed, 2 the command line was wrong.
constexpr int kOk = 0;
constexpr int kFailed = 1;
constexpr int kUsage = 2;

bool wantsHelp(const Args& args);
// Prints "plotaid <command>: <message>" and a pointer to --help on stderr; returns kUsage.
int usageError(const char* command, const std::string& message);
// Prints "plotaid <command>: <message>" on stderr; returns kFailed.
int failure(const char* command, const std::string& message);

// Whole-file I/O in binary mode; "-" names stdin or stdout. False with a readable reason.
// No input the tool reads may be larger than this.
constexpr std::size_t kMaxInputBytes = std::size_t(512) << 20;
bool readFile(const std::string& path, std::string& out, std::string& error);
bool writeFile(const std::string& path, const std::string& bytes, std::string& error);

} // namespace plotaid::tool

#endif

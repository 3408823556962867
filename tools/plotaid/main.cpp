#include "Command.h"

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <iostream>
#include <iterator>
#include <sstream>
#include <vector>

#include <sys/stat.h>

namespace plotaid::tool {

namespace {
std::vector<Command>& registry() {
    static std::vector<Command> all;
    return all;
}

void printUsage(std::FILE* to) {
    std::fprintf(to, "usage: plotaid [--help] [--version] <command> [<args>]\n\ncommands:\n");
    std::vector<Command> sorted = registry();
    std::sort(sorted.begin(), sorted.end(),
              [](const Command& a, const Command& b) { return std::string(a.name) < b.name; });
    for (const Command& c : sorted)
        std::fprintf(to, "  %-12s %s\n", c.name, c.summary);
    std::fprintf(to, "\n'plotaid <command> --help' describes a command.\n");
}
} // namespace

Registrar::Registrar(const Command& command) {
    registry().push_back(command);
}

const std::vector<Command>& commands() {
    return registry();
}

bool wantsHelp(const Args& args) {
    return std::any_of(args.begin(), args.end(),
                       [](const std::string& a) { return a == "--help" || a == "-h"; });
}

int usageError(const char* command, const std::string& message) {
    std::fprintf(stderr, "plotaid %s: %s\n(see 'plotaid %s --help')\n", command, message.c_str(), command);
    return kUsage;
}

int failure(const char* command, const std::string& message) {
    std::fprintf(stderr, "plotaid %s: %s\n", command, message.c_str());
    return kFailed;
}

bool readFile(const std::string& path, std::string& out, std::string& error) {
    const bool console = path == "-";
    const std::string name = console ? std::string("standard input") : "'" + path + "'";
    const std::string tooLarge = name + " is larger than " + std::to_string(kMaxInputBytes >> 20) + " MiB";
    struct stat st {};
    if (!console && ::stat(path.c_str(), &st) == 0 && S_ISREG(st.st_mode) &&
        static_cast<unsigned long long>(st.st_size) > kMaxInputBytes) {
        error = tooLarge;
        return false;
    }
    std::ifstream file;
    if (!console) {
        file.open(path, std::ios::binary);
        if (!file) {
            error = "cannot open " + name;
            return false;
        }
    }
    std::istream& in = console ? std::cin : file;
    // Read in slices so that a pipe or a growing file cannot exceed the cap either.
    out.clear();
    std::vector<char> slice(std::size_t(1) << 20);
    while (in) {
        in.read(slice.data(), static_cast<std::streamsize>(slice.size()));
        out.append(slice.data(), static_cast<std::size_t>(in.gcount()));
        if (out.size() > kMaxInputBytes) {
            out.clear();
            error = tooLarge;
            return false;
        }
    }
    if (in.bad()) {
        error = "cannot read " + name;
        return false;
    }
    return true;
}

bool writeFile(const std::string& path, const std::string& bytes, std::string& error) {
    if (path == "-") {
        std::cout.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
        std::cout.flush();
        if (!std::cout) {
            error = "cannot write to standard output";
            return false;
        }
        return true;
    }
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    out.close();
    if (!out) {
        error = "cannot write '" + path + "'";
        return false;
    }
    return true;
}

} // namespace plotaid::tool

int main(int argc, char** argv) {
    using namespace plotaid::tool;
    if (argc < 2) {
        printUsage(stderr);
        return kUsage;
    }
    const std::string first = argv[1];
    if (first == "--help" || first == "-h" || first == "help") {
        printUsage(stdout);
        return kOk;
    }
    if (first == "--version") {
        std::printf("plotaid %s\n", PLOTAID_VERSION);
        return kOk;
    }
    for (const Command& c : commands()) {
        if (first == c.name)
            return c.run(Args(argv + 2, argv + argc));
    }
    std::fprintf(stderr, "plotaid: unknown command '%s'\n", first.c_str());
    printUsage(stderr);
    return kUsage;
}

// plotaid compress / decompress: the compressed form of chart documents, data documents and data
// streams, made and read by the same wrapper the library uses.
#include "Command.h"

#include <zpack/zpack.h>

#include <cstdint>
#include <cstdio>
#include <string>
#include <unistd.h>

namespace plotaid::tool {
namespace {

struct Options {
    std::string input;
    std::string output = "-";
    bool hasLimit = false;
    std::size_t limit = 0;
};

// Whole decimal numbers only: "1e6", "-1", "12k" or an overflow are mistakes, not limits.
bool parseBytes(const std::string& text, std::size_t& value) {
    if (text.empty() || text.size() > 20)
        return false;
    value = 0;
    for (char c : text) {
        if (c < '0' || c > '9')
            return false;
        const std::size_t digit = static_cast<std::size_t>(c - '0');
        if (value > (SIZE_MAX - digit) / 10)
            return false;
        value = value * 10 + digit;
    }
    return true;
}

// Empty when args parse; the message of the usage error otherwise.
std::string parse(const Args& args, bool acceptsLimit, Options& options) {
    bool haveInput = false;
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        if (a == "-o" || a == "--output") {
            if (i + 1 >= args.size())
                return "option '" + a + "' needs a file name";
            options.output = args[++i];
        } else if (acceptsLimit && (a == "--limit" || a.rfind("--limit=", 0) == 0)) {
            std::string value;
            if (a == "--limit") {
                if (i + 1 >= args.size())
                    return "option '--limit' needs a number of bytes";
                value = args[++i];
            } else {
                value = a.substr(8);
            }
            if (!parseBytes(value, options.limit))
                return "'" + value + "' is not a number of bytes";
            options.hasLimit = true;
        } else if (a.size() > 1 && a[0] == '-') {
            return "unknown option '" + a + "'";
        } else if (haveInput) {
            return "more than one input file ('" + options.input + "', '" + a + "')";
        } else {
            options.input = a;
            haveInput = true;
        }
    }
    if (!haveInput)
        return "no input file";
    return std::string();
}

std::string describe(const std::string& path) {
    return path == "-" ? "standard input" : "'" + path + "'";
}

// Only a file output leaves room on stdout for a summary.
void summarise(const char* verb, const Options& options, std::size_t in, std::size_t out) {
    if (options.output != "-")
        std::printf("%s %s (%zu bytes) to '%s' (%zu bytes)\n", verb, describe(options.input).c_str(), in,
                    options.output.c_str(), out);
}

int readInput(const char* command, const Options& options, std::string& bytes) {
    std::string error;
    if (!readFile(options.input, bytes, error))
        return failure(command, error);
    return kOk;
}

int writeOutput(const char* command, const Options& options, const std::string& bytes) {
    std::string error;
    if (!writeFile(options.output, bytes, error))
        return failure(command, error);
    return kOk;
}

constexpr const char* kCompress = "compress";
constexpr const char* kDecompress = "decompress";

int runCompress(const Args& args) {
    if (wantsHelp(args)) {
        std::printf("usage: plotaid compress IN [-o OUT]\n\n"
                    "Compresses IN (any bytes; '-' reads standard input) into a zlib stream, the\n"
                    "compressed form of chart documents, data documents and data streams. The result\n"
                    "goes to OUT, or to standard output when OUT is '-' or not given.\n\n"
                    "options:\n"
                    "  -o, --output OUT  write the compressed text to OUT\n"
                    "  -h, --help        show this help\n");
        return kOk;
    }
    Options options;
    if (const std::string problem = parse(args, false, options); !problem.empty())
        return usageError(kCompress, problem);
    if (options.output == "-" && ::isatty(STDOUT_FILENO))
        return usageError(kCompress, "compressed bytes would go to the terminal; name a file with -o");
    std::string input;
    if (const int rc = readInput(kCompress, options, input); rc != kOk)
        return rc;
    std::string packed;
    if (!zpack::compressString(input, packed))
        return failure(kCompress, "cannot compress " + describe(options.input));
    if (const int rc = writeOutput(kCompress, options, packed); rc != kOk)
        return rc;
    summarise("compressed", options, input.size(), packed.size());
    return kOk;
}

int runDecompress(const Args& args) {
    if (wantsHelp(args)) {
        std::printf("usage: plotaid decompress IN [-o OUT] [--limit BYTES]\n\n"
                    "Decompresses the zlib stream IN ('-' reads standard input). The result goes to\n"
                    "OUT, or to standard output when OUT is '-' or not given. A damaged, truncated or\n"
                    "foreign stream, or one that would yield more than the limit, is refused.\n\n"
                    "options:\n"
                    "  -o, --output OUT  write the decompressed text to OUT\n"
                    "  --limit BYTES     refuse to produce more than BYTES bytes (default %zu)\n"
                    "  -h, --help        show this help\n",
                    zpack::kDefaultDecompressionLimit);
        return kOk;
    }
    Options options;
    if (const std::string problem = parse(args, true, options); !problem.empty())
        return usageError(kDecompress, problem);
    std::string packed;
    if (const int rc = readInput(kDecompress, options, packed); rc != kOk)
        return rc;
    if (options.hasLimit)
        zpack::setDecompressionLimit(options.limit);
    std::string text;
    if (!zpack::decompressString(text, packed)) {
        if (packed.empty() || static_cast<unsigned char>(packed[0]) != 0x78)
            return failure(kDecompress, describe(options.input) + " is not a compressed text");
        return failure(kDecompress,
                       "cannot decompress " + describe(options.input) +
                           ": the stream is damaged or truncated, or its text exceeds the limit of " +
                           std::to_string(zpack::decompressionLimit()) + " bytes");
    }
    if (const int rc = writeOutput(kDecompress, options, text); rc != kOk)
        return rc;
    summarise("decompressed", options, packed.size(), text.size());
    return kOk;
}

const Registrar compressCommand({kCompress, "compress a file into a zlib stream", runCompress});
const Registrar decompressCommand({kDecompress, "decompress a zlib stream, within a size limit",
                                   runDecompress});

} // namespace
} // namespace plotaid::tool

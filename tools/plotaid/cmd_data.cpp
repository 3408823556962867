// plotaid data: chart data between the binary data stream and the XML data document, and a look
// at what either holds.
#include "Command.h"

#include <plotaid/VarDataProcessor.h>
#include <plotaid/XmlDataHandler.h>

#include <zpack/zpack.h>

#include <algorithm>
#include <climits>
#include <cstdio>
#include <memory>
#include <string>
#include <vector>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "data";

void printHelp() {
    std::printf(
        "usage: plotaid data to-xml STREAM [--compressed] [-o OUT]\n"
        "       plotaid data to-stream XMLDATA [-o OUT]\n"
        "       plotaid data show FILE [--rows N]\n\n"
        "to-xml     the XML data document of a data stream (compressed with --compressed)\n"
        "to-stream  the data stream of an XML data document (plain or compressed, current or 1.4 form)\n"
        "show       data sources, variables, row counts and the first rows of a stream or XML data\n"
        "OUT and FILE may be '-' for standard output and input.\n");
}

struct Options {
    std::string input;
    std::string output = "-";
    bool compressed = false;
    unsigned rows = 10;
};

std::string parse(const Args& args, const std::string& action, Options& options) {
    bool haveInput = false;
    for (std::size_t i = 1; i < args.size(); ++i) {
        const std::string& a = args[i];
        if ((a == "-o" || a == "--output") && action != "show") {
            if (i + 1 >= args.size())
                return "option '" + a + "' needs a file name";
            options.output = args[++i];
        } else if (a == "--compressed" && action == "to-xml") {
            options.compressed = true;
        } else if (a == "--rows" && action == "show") {
            if (i + 1 >= args.size())
                return "option '--rows' needs a number";
            const std::string& n = args[++i];
            if (n.empty() || n.size() > 9 || n.find_first_not_of("0123456789") != std::string::npos)
                return "option '--rows' needs a whole number, not '" + n + "'";
            options.rows = static_cast<unsigned>(std::stoul(n));
        } else if (a.size() > 1 && a[0] == '-') {
            return "unknown option '" + a + "'";
        } else if (haveInput) {
            return "more than one input file";
        } else {
            options.input = a;
            haveInput = true;
        }
    }
    if (!haveInput)
        return "no input file";
    return std::string();
}

bool isRawStream(const std::string& bytes) {
    return bytes.size() >= 8 && static_cast<unsigned char>(bytes[0]) <= 1 &&
           static_cast<unsigned char>(bytes[1]) == 0xB0;
}

// A stream (raw or compressed) is read directly; anything else is taken for XML data.
bool loadStore(const std::string& bytes, VarDataProcessor& store, std::string& kind) {
    if (bytes.size() > UINT_MAX)
        return false;
    bool stream = isRawStream(bytes);
    const bool compressed = !bytes.empty() && static_cast<unsigned char>(bytes[0]) == 0x78;
    if (compressed) {
        std::string plain;
        if (!zpack::decompressString(plain, bytes))
            return false;
        stream = isRawStream(plain);
    }
    std::string copy = bytes;
    if (stream) {
        kind = compressed ? "data stream" : "uncompressed data stream";
        return store.ReadStreamData(copy.data(), static_cast<unsigned>(copy.size()));
    }
    kind = compressed ? "compressed XML data" : "XML data";
    XmlDataHandler handler(copy);
    unsigned length = 0;
    std::unique_ptr<unsigned char[]> s(handler.GetDataStream(length));
    return s && store.ReadStreamData(s.get(), length);
}

std::string cell(std::string text, std::size_t width) {
    if (text.size() > width)
        text = text.substr(0, width - 3) + "...";
    return text;
}

void show(VarDataProcessor& store, const std::string& kind, unsigned maxRows) {
    std::vector<std::string> sources;
    store.GetSourceNames(sources);
    std::printf("%s: %zu data source%s\n", kind.c_str(), sources.size(), sources.size() == 1 ? "" : "s");
    constexpr std::size_t kMaxWidth = 24;
    for (const std::string& source : sources) {
        std::vector<std::string> variables;
        store.GetVariableNames(source, variables);
        const unsigned rows = store.GetRowCount(source);
        std::printf("\nsource \"%s\": %u row%s, %zu variable%s\n", source.c_str(), rows, rows == 1 ? "" : "s",
                    variables.size(), variables.size() == 1 ? "" : "s");
        if (variables.empty())
            continue;
        const unsigned shown = std::min(rows, maxRows);
        std::vector<std::vector<std::string>> table(shown + 1);
        table[0].push_back("row");
        for (unsigned r = 0; r < shown; ++r)
            table[r + 1].push_back(std::to_string(r));
        for (const std::string& v : variables) {
            table[0].push_back(cell(v, kMaxWidth));
            for (unsigned r = 0; r < shown; ++r)
                table[r + 1].push_back(cell(store.GetValueAsString(source, v, r), kMaxWidth));
        }
        std::vector<std::size_t> widths(table[0].size(), 0);
        for (const auto& line : table)
            for (std::size_t c = 0; c < line.size(); ++c)
                widths[c] = std::max(widths[c], line[c].size());
        for (const auto& line : table) {
            std::string text;
            for (std::size_t c = 0; c < line.size(); ++c) {
                // Numbers right-aligned, everything else (and the header) left-aligned.
                const bool number = &line != &table[0] && !line[c].empty() &&
                                    line[c].find_first_not_of("0123456789.-+eE") == std::string::npos;
                const std::string pad(widths[c] - line[c].size(), ' ');
                text += (c ? "  " : "") + (number ? pad + line[c] : line[c] + pad);
            }
            while (!text.empty() && text.back() == ' ')
                text.pop_back();
            std::printf("%s\n", text.c_str());
        }
        if (shown < rows)
            std::printf("... %u more row%s\n", rows - shown, rows - shown == 1 ? "" : "s");
    }
}

int run(const Args& args) {
    if (wantsHelp(args)) {
        printHelp();
        return kOk;
    }
    if (args.empty())
        return usageError(kName, "no action (to-xml, to-stream or show)");
    const std::string& action = args[0];
    if (action != "to-xml" && action != "to-stream" && action != "show")
        return usageError(kName, "unknown action '" + action + "'");
    Options options;
    const std::string problem = parse(args, action, options);
    if (!problem.empty())
        return usageError(kName, problem);

    std::string input, error;
    if (!readFile(options.input, input, error))
        return failure(kName, error);
    if (input.size() > UINT_MAX)
        return failure(kName, "'" + options.input + "' is too large");

    if (action == "to-xml") {
        XmlDataHandler handler(reinterpret_cast<const unsigned char*>(input.data()),
                               static_cast<unsigned>(input.size()));
        std::string xml;
        if (input.empty() || !handler.GetXmlData(xml, options.compressed))
            return failure(kName, "'" + options.input + "' is no readable data stream");
        if (!writeFile(options.output, xml, error))
            return failure(kName, error);
        return kOk;
    }
    if (action == "to-stream") {
        XmlDataHandler handler(input);
        unsigned length = 0;
        std::unique_ptr<unsigned char[]> stream(handler.GetDataStream(length));
        if (!stream)
            return failure(kName, "'" + options.input + "' holds no readable data source");
        if (!writeFile(options.output, std::string(reinterpret_cast<char*>(stream.get()), length), error))
            return failure(kName, error);
        return kOk;
    }
    VarDataProcessor store;
    std::string kind;
    if (!loadStore(input, store, kind))
        return failure(kName, "'" + options.input + "' is neither a readable data stream nor XML data");
    show(store, kind, options.rows);
    return kOk;
}

const Registrar registrar({kName, "convert and show chart data (data streams, XML data)", run});

} // namespace
} // namespace plotaid::tool

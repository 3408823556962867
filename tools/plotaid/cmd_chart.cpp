// plotaid chart split CHART | chart merge CHART DATA: a chart apart from its data and back.
#include "ChartInput.h"
#include "Command.h"
#include "foundation/RecordSink.h"

#include <plotaid/ChartTransformer.h>

#include <zpack/zpack.h>

#include <cstdio>
#include <string>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "chart";

// A path without its extension (and without ".chart" before it), so outputs land beside it.
std::string stemOf(const std::string& path) {
    const std::string chartSuffix = ".chart.xml";
    if (path.size() > chartSuffix.size() &&
        path.compare(path.size() - chartSuffix.size(), chartSuffix.size(), chartSuffix) == 0)
        return path.substr(0, path.size() - chartSuffix.size());
    const std::size_t slash = path.find_last_of('/');
    const std::size_t dot = path.find_last_of('.');
    if (dot == std::string::npos || (slash != std::string::npos && dot < slash))
        return path;
    return path.substr(0, dot);
}

int split(const Args& args) {
    std::string chartPath, outPath, dataPath;
    bool packed = false;
    for (std::size_t i = 1; i < args.size(); ++i) {
        const std::string& a = args[i];
        const bool hasValue = i + 1 < args.size();
        if ((a == "-o" || a == "--output") && hasValue)
            outPath = args[++i];
        else if (a == "--data" && hasValue)
            dataPath = args[++i];
        else if (a == "--compressed")
            packed = true;
        else if (chartPath.empty() && !a.empty() && a[0] != '-')
            chartPath = a;
        else
            return usageError(kName, "unexpected argument '" + a + "'");
    }
    if (chartPath.empty())
        return usageError(kName, "no chart given (chart split CHART)");
    if (chartPath == "-" && (outPath.empty() || dataPath.empty()))
        return usageError(kName, "a chart read from standard input needs -o and --data");
    if (outPath.empty())
        outPath = stemOf(chartPath) + ".chart.xml";
    if (dataPath.empty())
        dataPath = stemOf(outPath == "-" ? chartPath : outPath) + ".data.xml";

    std::string error;
    ChartInput input;
    if (!input.load(chartPath, std::string(), error))
        return failure(kName, error);
    ChartTransformer& chart = input.transformer();
    const std::string chartText = packed ? chart.getCompressedXML() : chart.getXML();
    const std::string data = chart.getCompressedData();
    std::string dataText;
    if (!data.empty() && !packed && !zpack::decompressString(dataText, data))
        return failure(kName, "the data could not be written");
    if (!writeFile(outPath, chartText, error))
        return failure(kName, outPath + ": " + error);
    if (data.empty()) {
        std::fprintf(stderr, "plotaid %s: %s has no data sources; no data document written\n", kName,
                     chartPath.c_str());
        return kOk;
    }
    if (!writeFile(dataPath, packed ? data : dataText, error))
        return failure(kName, dataPath + ": " + error);
    return kOk;
}

int merge(const Args& args) {
    std::string chartPath, dataPath, outPath = "-";
    bool packed = false;
    for (std::size_t i = 1; i < args.size(); ++i) {
        const std::string& a = args[i];
        const bool hasValue = i + 1 < args.size();
        if ((a == "-o" || a == "--output") && hasValue)
            outPath = args[++i];
        else if (a == "--compressed")
            packed = true;
        else if (chartPath.empty() && !a.empty() && a[0] != '-')
            chartPath = a;
        else if (dataPath.empty() && !a.empty() && a[0] != '-')
            dataPath = a;
        else
            return usageError(kName, "unexpected argument '" + a + "'");
    }
    if (chartPath.empty() || dataPath.empty())
        return usageError(kName, "chart merge needs a chart and its data (chart merge CHART DATA)");
    std::string error;
    ChartInput input;
    if (!input.load(chartPath, dataPath, error))
        return failure(kName, error);
    ChartTransformer& chart = input.transformer();
    if (chart.getCompressedData().empty())
        return failure(kName, dataPath + ": the data cannot be read as chart data");
    // Data that the library refuses while merging would leave the chart without its rows.
    detail::RecordCollector records;
    const std::string text = chart.getEntireXML(u"UTF-8");
    if (text.empty())
        return failure(kName, "the chart could not be written");
    for (const detail::LogRecord& r : records.records())
        if (r.isError())
            return failure(kName, dataPath + ": " + r.message);
    if (!writeFile(outPath, packed ? compressed(text) : text, error))
        return failure(kName, outPath + ": " + error);
    return kOk;
}

int run(const Args& args) {
    if (wantsHelp(args) || args.empty()) {
        std::printf(
            "usage: plotaid chart split CHART [-o OUT] [--data DATA] [--compressed]\n"
            "       plotaid chart merge CHART DATA [-o OUT] [--compressed]\n\n"
            "split writes the chart with its data sources replaced by references to OUT (default:\n"
            "CHART's name with .chart.xml) and the sources as a data document to DATA (default: OUT's\n"
            "name with .data.xml). merge puts the data back in place of the references and writes the\n"
            "whole document to OUT (standard output by default). Charts may be plain or compressed;\n"
            "DATA given to merge may be a data document or a data stream, plain or compressed.\n"
            "--compressed writes compressed (zlib) output.\n"
            "Exit status: 0 on success, 1 when an input cannot be read, 2 on a usage error.\n");
        return args.empty() ? kUsage : kOk;
    }
    if (args[0] == "split")
        return split(args);
    if (args[0] == "merge")
        return merge(args);
    return usageError(kName, "unknown action '" + args[0] + "' (split or merge)");
}

const Registrar registrar({kName, "split a chart from its data, or merge them back", run});

} // namespace
} // namespace plotaid::tool

// plotaid pack CHART [--reference REF] [-o OUT]: lays out the chart's frames as a host does after
// building or restyling it, and writes the chart.
#include "ChartInput.h"
#include "Command.h"

#include <plotaid/FramePacker.h>

#include <grx/GrxModel.h>

#include <cstdio>
#include <string>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "pack";

int run(const Args& args) {
    if (wantsHelp(args)) {
        std::printf("usage: plotaid pack CHART [--reference REF] [-o OUT]\n\n"
                    "Lays out the frames of the chart (plain or compressed chart XML): titles stacked from\n"
                    "the top, footnotes from the bottom, the graph between them, legends, statistics\n"
                    "summaries and keys in a column on the right. A chart that asks to preserve its\n"
                    "locations is written unchanged; with more than one graph only the subtitle and the\n"
                    "side column move. The chart is written to OUT (standard output when -o is not given\n"
                    "or is \"-\").\n\n"
                    "--reference REF  a chart in which frames placed only by fixed values (and graphs\n"
                    "                 whose attachments the user made) mark the frames to leave alone.\n\n"
                    "Exit status: 0 when the chart was packed and written, 1 otherwise, 2 on a usage error.\n");
        return kOk;
    }
    std::string chartPath, referencePath, outPath = "-";
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        const bool hasValue = i + 1 < args.size();
        if ((a == "-o" || a == "--output") && hasValue)
            outPath = args[++i];
        else if (a == "--reference" && hasValue)
            referencePath = args[++i];
        else if (!a.empty() && (a[0] != '-' || a == "-") && chartPath.empty())
            chartPath = a;
        else
            return usageError(kName, "unexpected argument '" + a + "'");
    }
    if (chartPath.empty())
        return usageError(kName, "no chart given");
    std::string error;
    ChartInput chart, reference;
    if (!chart.load(chartPath, "", error))
        return failure(kName, error);
    if (!referencePath.empty() && !reference.load(referencePath, "", error))
        return failure(kName, error);
    GrxVisualization* vis = chart.transformer().getVisualization();
    if (vis == nullptr)
        return failure(kName, chartPath + ": no chart to pack");
    FramePacker().packFrames(*vis, referencePath.empty() ? nullptr : reference.transformer().getVisualization());
    const std::string bytes = chart.transformer().getXML();
    if (bytes.empty())
        return failure(kName, "the chart could not be written");
    if (!writeFile(outPath, bytes, error))
        return failure(kName, outPath + ": " + error);
    return kOk;
}

const Registrar registrar({kName, "lay out a chart's titles, graph, legends and side frames", run});

} // namespace
} // namespace plotaid::tool

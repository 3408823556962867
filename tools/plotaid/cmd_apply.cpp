// plotaid apply --chart CHART [--data DATA] --template T [--template ...] [-o OUT] [--entire]
// [--compressed] [--report]: applies templates to a chart with its data, in order, and writes it.
#include "ChartInput.h"
#include "Command.h"

#include "templates/InstructionWalk.h"

#include <plotaid/ChartTransformer.h>

#include <cstdio>
#include <memory>
#include <string>
#include <vector>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "apply";

const char* outcomeText(detail::InstructionOutcome::Kind kind) {
    switch (kind) {
    case detail::InstructionOutcome::Applied:
        return "applied";
    case detail::InstructionOutcome::Unsupported:
        return "unsupported";
    case detail::InstructionOutcome::Failed:
        break;
    }
    return "failed";
}

// One report line per instruction, whatever the reason holds.
std::string oneLine(std::string text) {
    for (char& c : text)
        if (static_cast<unsigned char>(c) < 0x20)
            c = ' ';
    return text;
}

int run(const Args& args) {
    if (wantsHelp(args)) {
        std::printf(
            "usage: plotaid apply --chart CHART [--data DATA] --template TEMPLATE [--template ...]\n"
            "                     [-o OUT] [--entire] [--compressed] [--report]\n\n"
            "Applies each template to the chart, in the order given, and writes the chart to OUT\n"
            "(standard output when -o is not given or is \"-\"). The chart must be valid chart XML,\n"
            "plain or compressed; templates of the earlier form are converted first.\n\n"
            "--data DATA  the chart's data: a data stream or an XML data document, plain or compressed.\n"
            "             Without it, the data sources held in the chart itself are its data.\n"
            "The chart is written with its data sources as references unless --entire is given,\n"
            "which writes the whole document with the data put back in place of the references.\n"
            "--compressed writes it compressed (zlib).\n\n"
            "--report prints one line per instruction: the template, the instruction's position\n"
            "among the template's instructions, its tag, and what became of it:\n"
            "  applied          the action ran and reported no error\n"
            "  unsupported      no action carries out this tag (yet)\n"
            "  failed: REASON   the action ran and reported an error, threw, or changed nothing\n"
            "The report goes to standard output, or to standard error when the chart does.\n"
            "Exit status: 0 when every template was read and applied, 1 otherwise, 2 on a usage error.\n");
        return kOk;
    }
    std::string chartPath, dataPath, outPath = "-";
    std::vector<std::string> templatePaths;
    bool report = false, entire = false, packed = false;
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        const bool hasValue = i + 1 < args.size();
        if (a == "--chart" && hasValue)
            chartPath = args[++i];
        else if (a == "--data" && hasValue)
            dataPath = args[++i];
        else if (a == "--template" && hasValue)
            templatePaths.push_back(args[++i]);
        else if ((a == "-o" || a == "--output") && hasValue)
            outPath = args[++i];
        else if (a == "--report")
            report = true;
        else if (a == "--entire")
            entire = true;
        else if (a == "--compressed")
            packed = true;
        else
            return usageError(kName, "unexpected argument '" + a + "'");
    }
    if (chartPath.empty())
        return usageError(kName, "no chart given (--chart CHART)");
    if (templatePaths.empty())
        return usageError(kName, "no template given (--template TEMPLATE)");

    std::string error;
    ChartInput input;
    if (!input.load(chartPath, dataPath, error))
        return failure(kName, error);
    ChartTransformer& chart = input.transformer();
    if (input.hasData() && chart.getCompressedData().empty())
        return failure(kName, dataPath + ": the data cannot be read as chart data");

    FILE* reportOut = outPath == "-" ? stderr : stdout;
    bool allApplied = true;
    for (const std::string& path : templatePaths) {
        std::string text;
        if (!readFile(path, text, error)) {
            std::fprintf(stderr, "plotaid %s: %s: %s\n", kName, path.c_str(), error.c_str());
            allApplied = false;
            continue;
        }
        detail::WalkReport outcomes;
        if (!chart.applyTemplate(text)) {
            // A walk that started reports its instructions; one that did not never read the template.
            std::fprintf(stderr, "plotaid %s: %s: %s\n", kName, path.c_str(),
                         outcomes.outcomes().empty() ? "the template could not be parsed"
                                                     : "application abandoned");
            allApplied = false;
            if (outcomes.outcomes().empty())
                continue;
        }
        if (!report)
            continue;
        for (const detail::InstructionOutcome& o : outcomes.outcomes()) {
            std::fprintf(reportOut, "%s #%u %s: %s%s%s\n", path.c_str(), o.position, o.tag.c_str(),
                         outcomeText(o.kind), o.reason.empty() ? "" : ": ", oneLine(o.reason).c_str());
        }
        if (outcomes.outcomes().empty())
            std::fprintf(reportOut, "%s: no instructions\n", path.c_str());
    }

    const std::string text = entire ? chart.getEntireXML(u"UTF-8") : chart.getXML();
    if (text.empty())
        return failure(kName, "the chart could not be written");
    const std::string written = packed ? compressed(text) : text;
    if (!writeFile(outPath, written, error))
        return failure(kName, outPath + ": " + error);
    std::fflush(stdout);
    return allApplied ? kOk : kFailed;
}

const Registrar registrar({kName, "apply chart templates to a chart, optionally reporting each instruction",
                           run});

} // namespace
} // namespace plotaid::tool

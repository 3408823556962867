// plotaid apply --chart CHART --template T [--template ...] [-o OUT] [--report]: applies templates
// to a chart in order and writes the chart.
#include "Command.h"

#include "foundation/ValidatingParser.h"
#include "templates/InstructionWalk.h"

#include <plotaid/ChartException.h>
#include <plotaid/ChartTemplate.h>

#include <grx/GrxVisualization.h>

#include <kovar/KovarGoToCaller.h>

#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMElement.hpp>

#include <cstdio>
#include <memory>
#include <string>
#include <vector>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "apply";
// Larger inputs are refused before they are read into memory.

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
            "usage: plotaid apply --chart CHART --template TEMPLATE [--template ...] [-o OUT] [--report]\n\n"
            "Applies each template to the chart, in the order given, and writes the chart to OUT\n"
            "(standard output when -o is not given or is \"-\"). The chart must be valid chart XML;\n"
            "templates of the earlier form are converted first.\n\n"
            "--report prints one line per instruction: the template, the instruction's position\n"
            "among the template's instructions, its tag, and what became of it:\n"
            "  applied          the action ran and reported no error\n"
            "  unsupported      no action carries out this tag (yet)\n"
            "  failed: REASON   the action ran and reported an error, threw, or changed nothing\n"
            "The report goes to standard output, or to standard error when the chart does.\n"
            "Exit status: 0 when every template was read and applied, 1 otherwise, 2 on a usage error.\n");
        return kOk;
    }
    std::string chartPath, outPath = "-";
    std::vector<std::string> templatePaths;
    bool report = false;
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        const bool hasValue = i + 1 < args.size();
        if (a == "--chart" && hasValue)
            chartPath = args[++i];
        else if (a == "--template" && hasValue)
            templatePaths.push_back(args[++i]);
        else if ((a == "-o" || a == "--output") && hasValue)
            outPath = args[++i];
        else if (a == "--report")
            report = true;
        else
            return usageError(kName, "unexpected argument '" + a + "'");
    }
    if (chartPath.empty())
        return usageError(kName, "no chart given (--chart CHART)");
    if (templatePaths.empty())
        return usageError(kName, "no template given (--template TEMPLATE)");

    std::string chartText, error;
    if (!readFile(chartPath, chartText, error))
        return failure(kName, chartPath + ": " + error);
    detail::ValidatingParser parser;
    if (parser.parse(chartText, chartPath.c_str(),
                     ChartException("chart could not be read: " + chartPath, "tools/plotaid/cmd_apply", 0)) ==
        nullptr) {
        const std::vector<std::string>& errors = parser.lastErrors();
        return failure(kName,
                       chartPath + ": " + (errors.empty() ? std::string("not valid") : errors.front()));
    }
    detail::OwnedDocument document = parser.adoptDocument();
    XERCES_CPP_NAMESPACE::DOMElement* root = document->getDocumentElement();
    GrxVisualization visualization(root, true);
    document.release(); // the visualization owns it now

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
        try {
            ChartTemplate chartTemplate(visualization, nullptr);
            if (!chartTemplate.setTemplate(text)) {
                std::fprintf(stderr, "plotaid %s: %s: the template could not be parsed\n", kName,
                             path.c_str());
                allApplied = false;
                continue;
            }
            chartTemplate.applyTemplate();
        } catch (const KovarGoToCaller&) {
            std::fprintf(stderr, "plotaid %s: %s: application abandoned\n", kName, path.c_str());
            allApplied = false;
        } catch (const std::exception& e) {
            std::fprintf(stderr, "plotaid %s: %s: %s\n", kName, path.c_str(), e.what());
            allApplied = false;
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

    const std::string written = visualization.AsUTF8();
    if (!writeFile(outPath, written, error))
        return failure(kName, outPath + ": " + error);
    std::fflush(stdout);
    return allApplied ? kOk : kFailed;
}

const Registrar registrar({kName, "apply chart templates to a chart, optionally reporting each instruction",
                           run});

} // namespace
} // namespace plotaid::tool

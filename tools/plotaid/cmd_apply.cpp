// plotaid apply --chart CHART [--data DATA] --template T [--template ...] [-o OUT] [--entire]
// [--compressed] [--report] [--pack] [--popups]: applies templates to a chart with its data, in
// order, adds popups and lays out its frames when asked, and writes it.
// plotaid apply --template T [--template ...] -o OUTDIR [-j N] CHART...: the same for many charts.
#include "ChartInput.h"
#include "Command.h"

#include "foundation/ValidatingParser.h"
#include "foundation/XercesRuntime.h"
#include "templates/InstructionWalk.h"
#include "templates/TemplateConverter.h"

#include <plotaid/ChartTransformer.h>
#include <plotaid/FramePacker.h>

#include <grx/GrxModel.h>

#include <atomic>
#include <cstdio>
#include <filesystem>
#include <memory>
#include <set>
#include <string>
#include <thread>
#include <vector>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "apply";
constexpr const char* kPopupsRefused = "no popups added: the chart has popups already";

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

// Why a template that changed nothing could not be read, in the parser's words
// ("PATH:LINE:COLUMN: message") when it has any.
std::string unreadable(const std::string& path, const std::string& text) {
    std::string notXml;
    const detail::DocumentKind kind = detail::templateKind(text, notXml);
    if (!notXml.empty())
        return path + ":" + oneLine(notXml);
    detail::ValidatingParser parser;
    if (parser.parse(text, path.c_str(), ChartException("template refused: " + path, "plotaid apply", 0), kind) ==
            nullptr &&
        !parser.lastErrors().empty())
        return oneLine(parser.lastErrors().front());
    return path + ": the template could not be parsed";
}

// Options beyond these are refused in the batch form.
struct Options {
    std::string chartPath, dataPath, outPath = "-";
    std::vector<std::string> templatePaths, charts;
    unsigned jobs = 1;
    bool report = false, entire = false, packed = false, layout = false, popups = false;
};

// The chart as written, its frames laid out and compressed when asked.
std::string written(ChartTransformer& chart, const Options& o) {
    if (o.layout && chart.getVisualization())
        FramePacker().packFrames(*chart.getVisualization(), nullptr);
    const std::string text = o.entire ? chart.getEntireXML(u"UTF-8") : chart.getXML();
    return text.empty() || !o.packed ? text : compressed(text);
}

// One chart of the batch form: empty on success, else the line that says why not.
std::string restyle(const std::string& chartPath, const std::vector<std::string>& templatePaths,
                    const std::vector<std::string>& templates, const Options& o) {
    std::string error;
    ChartInput input;
    if (!input.load(chartPath, "", error))
        return error;
    ChartTransformer& chart = input.transformer();
    for (std::size_t i = 0; i < templates.size(); ++i)
        if (!chart.applyTemplate(templates[i]))
            return chartPath + ": " + unreadable(templatePaths[i], templates[i]);
    if (o.popups && chart.addPopups() == 0)
        return chartPath + ": " + kPopupsRefused;
    const std::string bytes = written(chart, o);
    if (bytes.empty())
        return chartPath + ": the chart could not be written";
    const std::string out = (std::filesystem::path(o.outPath) / std::filesystem::path(chartPath).filename()).string();
    if (!writeFile(out, bytes, error))
        return out + ": " + error;
    return std::string();
}

int runBatch(const Options& o) {
    if (o.outPath == "-")
        return usageError(kName, "the batch form writes to a folder (-o OUTDIR)");
    if (!o.dataPath.empty() || o.report)
        return usageError(kName, "--data and --report need the single-chart form (--chart CHART)");
    std::set<std::string> names;
    for (const std::string& c : o.charts)
        if (!names.insert(std::filesystem::path(c).filename().string()).second)
            return usageError(kName, "two charts would be written to the same file: " + c);
    std::error_code ec;
    std::filesystem::create_directories(o.outPath, ec);
    if (!std::filesystem::is_directory(o.outPath))
        return failure(kName, o.outPath + ": not a folder");
    std::vector<std::string> templates(o.templatePaths.size());
    std::string error;
    for (std::size_t i = 0; i < templates.size(); ++i)
        if (!readFile(o.templatePaths[i], templates[i], error))
            return failure(kName, o.templatePaths[i] + ": " + error);

    // One transformer per chart, each on one thread; the failures are printed in the order given.
    // Xerces-C, and with it the grammars read once, stays up between charts.
    const detail::XercesRuntime up;
    std::vector<std::string> failures(o.charts.size());
    std::atomic<std::size_t> next{0};
    const auto work = [&] {
        for (std::size_t i; (i = next++) < o.charts.size();)
            failures[i] = restyle(o.charts[i], o.templatePaths, templates, o);
    };
    std::vector<std::thread> workers;
    for (unsigned j = 1; j < o.jobs && j < o.charts.size(); ++j)
        workers.emplace_back(work);
    work();
    for (std::thread& t : workers)
        t.join();
    bool all = true;
    for (const std::string& f : failures) {
        if (f.empty())
            continue;
        std::fprintf(stderr, "plotaid %s: %s\n", kName, f.c_str());
        all = false;
    }
    return all ? kOk : kFailed;
}

int run(const Args& args) {
    if (wantsHelp(args)) {
        std::printf(
            "usage: plotaid apply --chart CHART [--data DATA] --template TEMPLATE [--template ...]\n"
            "                     [-o OUT] [--entire] [--compressed] [--report] [--pack] [--popups]\n"
            "       plotaid apply --template TEMPLATE [--template ...] -o OUTDIR [-j N]\n"
            "                     [--entire] [--compressed] [--pack] [--popups] CHART...\n\n"
            "Applies each template to the chart, in the order given, and writes the chart to OUT\n"
            "(standard output when -o is not given or is \"-\"). The chart must be valid chart XML,\n"
            "plain or compressed; templates of the earlier form are converted first.\n\n"
            "--data DATA  the chart's data: a data stream or an XML data document, plain or compressed.\n"
            "             Without it, the data sources held in the chart itself are its data.\n"
            "The chart is written with its data sources as references unless --entire is given,\n"
            "which writes the whole document with the data put back in place of the references.\n"
            "--compressed writes it compressed (zlib).\n"
            "--pack lays out the chart's frames after the templates, as a host does (see 'plotaid pack').\n\n"
            "--popups gives every element, after the templates, a popup naming its x, y, z and legend\n"
            "values; a chart that has popups already gets none and the command fails. With --popups\n"
            "the templates may be left out.\n\n"
            "--report prints one line per instruction: the template, the instruction's position\n"
            "among the template's instructions, its tag, and what became of it:\n"
            "  applied          the action ran and reported no error\n"
            "  unsupported      no action carries out this tag (yet)\n"
            "  failed: REASON   the action ran and reported an error, threw, or changed nothing\n"
            "The report goes to standard output, or to standard error when the chart does.\n"
            "A template that cannot be read is reported with the parser's line, column and message.\n\n"
            "The second form restyles each CHART (its data held in the chart itself) with the\n"
            "templates and writes it under its own file name into OUTDIR (made when missing),\n"
            "N charts at a time (-j, default 1). It prints one line per chart that failed.\n\n"
            "Exit status: 0 when every template was read and applied (to every chart), 1 otherwise,\n"
            "2 on a usage error.\n");
        return kOk;
    }
    Options o;
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        const bool hasValue = i + 1 < args.size();
        if (a == "--chart" && hasValue)
            o.chartPath = args[++i];
        else if (a == "--data" && hasValue)
            o.dataPath = args[++i];
        else if (a == "--template" && hasValue)
            o.templatePaths.push_back(args[++i]);
        else if ((a == "-o" || a == "--output") && hasValue)
            o.outPath = args[++i];
        else if (a == "-j" && hasValue) {
            const std::string& n = args[++i];
            if (n.empty() || n.size() > 3 || n.find_first_not_of("0123456789") != std::string::npos ||
                std::stoul(n) == 0)
                return usageError(kName, "-j wants a number of charts at a time, 1 to 999");
            o.jobs = static_cast<unsigned>(std::stoul(n));
        } else if (a == "--report")
            o.report = true;
        else if (a == "--popups")
            o.popups = true;
        else if (a == "--entire")
            o.entire = true;
        else if (a == "--compressed")
            o.packed = true;
        else if (a == "--pack")
            o.layout = true;
        else if (!a.empty() && a[0] != '-')
            o.charts.push_back(a);
        else
            return usageError(kName, "unexpected argument '" + a + "'");
    }
    if (o.templatePaths.empty() && !o.popups)
        return usageError(kName, "no template given (--template TEMPLATE or --popups)");
    if (!o.charts.empty() && !o.chartPath.empty())
        return usageError(kName, "give the chart with --chart or as CHART..., not both");
    if (!o.charts.empty())
        return runBatch(o);
    if (o.chartPath.empty())
        return usageError(kName, "no chart given (--chart CHART)");
    const std::string& chartPath = o.chartPath;
    const std::string& dataPath = o.dataPath;
    const std::string& outPath = o.outPath;
    const bool report = o.report;

    std::string error;
    ChartInput input;
    if (!input.load(chartPath, dataPath, error))
        return failure(kName, error);
    ChartTransformer& chart = input.transformer();
    if (input.hasData() && chart.getCompressedData().empty())
        return failure(kName, dataPath + ": the data cannot be read as chart data");

    FILE* reportOut = outPath == "-" ? stderr : stdout;
    bool allApplied = true;
    for (const std::string& path : o.templatePaths) {
        std::string text;
        if (!readFile(path, text, error)) {
            std::fprintf(stderr, "plotaid %s: %s: %s\n", kName, path.c_str(), error.c_str());
            allApplied = false;
            continue;
        }
        detail::WalkReport outcomes;
        if (!chart.applyTemplate(text)) {
            // A walk that started reports its instructions; one that did not never read the template.
            if (outcomes.outcomes().empty())
                std::fprintf(stderr, "plotaid %s: %s\n", kName, unreadable(path, text).c_str());
            else
                std::fprintf(stderr, "plotaid %s: %s: application abandoned\n", kName, path.c_str());
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

    if (o.popups && chart.addPopups() == 0) {
        std::fprintf(stderr, "plotaid %s: %s: %s\n", kName, chartPath.c_str(), kPopupsRefused);
        allApplied = false;
    }

    const std::string bytes = written(chart, o);
    if (bytes.empty())
        return failure(kName, "the chart could not be written");
    if (!writeFile(outPath, bytes, error))
        return failure(kName, outPath + ": " + error);
    std::fflush(stdout);
    return allApplied ? kOk : kFailed;
}

const Registrar registrar({kName, "apply chart templates to a chart, optionally reporting each instruction",
                           run});

} // namespace
} // namespace plotaid::tool

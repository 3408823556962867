// plotaid render CHART [--data DATA] [--template T ...] -o OUT.svg|png|pdf [--size WxH]
// [--before-after]: draws a chart, after its templates, as a picture.
#include "ChartInput.h"
#include "Command.h"

#include <plotaid/ChartRenderer.h>

#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "render";

bool parseSize(const std::string& text, double& w, double& h) {
    char* end = nullptr;
    w = std::strtod(text.c_str(), &end);
    if (end == text.c_str() || (*end != 'x' && *end != 'X'))
        return false;
    const char* rest = end + 1;
    h = std::strtod(rest, &end);
    return end != rest && *end == '\0' && w >= 16 && h >= 16 && w <= 10000 && h <= 10000;
}

bool prepare(ChartInput& d, const std::string& chartPath, const std::string& dataPath,
             const std::vector<std::string>& templatePaths, std::string& error) {
    if (!d.load(chartPath, dataPath, error))
        return false;
    for (const std::string& path : templatePaths) {
        std::string text;
        if (!readFile(path, text, error)) {
            error = path + ": " + error;
            return false;
        }
        if (!d.transformer().applyTemplate(text)) {
            error = path + ": the template could not be applied (see 'plotaid apply --report')";
            return false;
        }
    }
    return true;
}

int run(const Args& args) {
    if (wantsHelp(args)) {
        std::printf(
            "usage: plotaid render CHART [--data DATA] [--template T ...] -o OUT [--size WxH]\n"
            "                      [--before-after]\n\n"
            "Draws the chart (plain or compressed chart XML, with the data it embeds or DATA, a data\n"
            "stream or XML data document) after applying each template in order. The format follows\n"
            "OUT's extension: .svg, .png or .pdf. Frames without locations are laid out first.\n\n"
            "--size WxH       the picture's size: pixels for PNG, points otherwise (default 800x600)\n"
            "--before-after   the chart without and with the templates, side by side\n\n"
            "Exit status: 0 when the picture was written, 1 otherwise, 2 on a usage error.\n");
        return kOk;
    }
    std::string chartPath, dataPath, outPath;
    std::vector<std::string> templates;
    double width = 800, height = 600;
    bool beforeAfter = false;
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        const bool hasValue = i + 1 < args.size();
        if ((a == "-o" || a == "--output") && hasValue)
            outPath = args[++i];
        else if (a == "--data" && hasValue)
            dataPath = args[++i];
        else if (a == "--template" && hasValue)
            templates.push_back(args[++i]);
        else if (a == "--size" && hasValue) {
            if (!parseSize(args[++i], width, height))
                return usageError(kName, "--size takes WIDTHxHEIGHT, each 16 to 10000");
        } else if (a == "--before-after")
            beforeAfter = true;
        else if (!a.empty() && a[0] != '-' && chartPath.empty())
            chartPath = a;
        else
            return usageError(kName, "unexpected argument '" + a + "'");
    }
    if (chartPath.empty())
        return usageError(kName, "no chart given");
    ChartRenderer::Format format;
    if (outPath.empty() || !ChartRenderer::formatOf(outPath, format))
        return usageError(kName, "-o must name a .svg, .png or .pdf file");
    if (beforeAfter && templates.empty())
        return usageError(kName, "--before-after needs at least one --template");

    std::string error;
    ChartInput after, before;
    if (!prepare(after, chartPath, dataPath, templates, error))
        return failure(kName, error);
    if (beforeAfter && !prepare(before, chartPath, dataPath, {}, error))
        return failure(kName, error);
    ChartRenderer renderer;
    renderer.setSize(width, height);
    std::string bytes;
    const bool drawn =
        beforeAfter ? renderer.renderSideBySide(before.transformer(), after.transformer(), format, bytes)
                    : renderer.render(after.transformer(), format, bytes);
    if (!drawn)
        return failure(kName, chartPath + ": " + renderer.lastError());
    if (!writeFile(outPath, bytes, error))
        return failure(kName, outPath + ": " + error);
    return kOk;
}

const Registrar registrar({kName, "draw a chart, after its templates, as SVG, PNG or PDF", run});

} // namespace
} // namespace plotaid::tool

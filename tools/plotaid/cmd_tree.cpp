// plotaid tree: the display settings and the PMML of a decision tree, as the host's tree viewer
// receives them.
#include "Command.h"

#include "foundation/ValidatingParser.h"

#include <plotaid/TreeTransformer.h>

#include <cstdio>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace plotaid::tool {
namespace {

constexpr const char* kTree = "tree";

struct Options {
    std::string pmml;
    std::string settings;
    std::string templateFile;
    std::string pmmlOut;
    std::string compressedOut;
    std::optional<TreeTransformer::TreeOrientation> orientation;
    std::optional<TreeTransformer::TreeDisplayOption> contents;
    std::optional<int> zoom;
    std::optional<std::string> font;
    std::optional<TreeTransformer::ColorIds> colorId;
    std::vector<std::string> colors;
    std::optional<std::string> language;
    std::string country;
};

std::vector<std::string> split(const std::string& text, char separator) {
    std::vector<std::string> parts;
    std::size_t start = 0;
    for (std::size_t at; (at = text.find(separator, start)) != std::string::npos; start = at + 1)
        parts.push_back(text.substr(start, at - start));
    parts.push_back(text.substr(start));
    return parts;
}

bool parseZoom(const std::string& text, int& zoom) {
    if (text.empty() || text.size() > 3)
        return false;
    zoom = 0;
    for (char c : text) {
        if (c < '0' || c > '9')
            return false;
        zoom = zoom * 10 + (c - '0');
    }
    return zoom >= 2 && zoom <= 500;
}

// Empty when args parse; the message of the usage error otherwise.
std::string parse(const Args& args, Options& o) {
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        const auto value = [&](std::string& out) {
            if (i + 1 >= args.size())
                return false;
            out = args[++i];
            return true;
        };
        std::string v;
        if (a.size() < 3 || a.compare(0, 2, "--") != 0)
            return "unexpected argument '" + a + "'";
        static const char* const known[] = {
            "--pmml",        "--settings", "--template", "--pmml-out", "--compressed-pmml-out",
            "--orientation", "--contents", "--zoom",     "--font",     "--colors",
            "--language"};
        bool isKnown = false;
        for (const char* name : known)
            isKnown = isKnown || a == name;
        if (!isKnown)
            return "unknown option '" + a + "'";
        if (!value(v))
            return "option '" + a + "' needs a value";
        if (a == "--pmml") {
            o.pmml = v;
        } else if (a == "--settings") {
            o.settings = v;
        } else if (a == "--template") {
            o.templateFile = v;
        } else if (a == "--pmml-out") {
            o.pmmlOut = v;
        } else if (a == "--compressed-pmml-out") {
            o.compressedOut = v;
        } else if (a == "--orientation") {
            const char* names[] = {"top-down", "left-to-right", "right-to-left"};
            for (int k = 0; k < 3; ++k)
                if (v == names[k])
                    o.orientation = static_cast<TreeTransformer::TreeOrientation>(k);
            if (!o.orientation)
                return "orientation '" + v + "' is not top-down, left-to-right or right-to-left";
        } else if (a == "--contents") {
            const char* names[] = {"table", "graph", "both"};
            for (int k = 0; k < 3; ++k)
                if (v == names[k])
                    o.contents = static_cast<TreeTransformer::TreeDisplayOption>(k);
            if (!o.contents)
                return "contents '" + v + "' is not table, graph or both";
        } else if (a == "--zoom") {
            int zoom = 0;
            if (!parseZoom(v, zoom))
                return "zoom '" + v + "' is not a whole number from 2 to 500";
            o.zoom = zoom;
        } else if (a == "--font") {
            o.font = v;
        } else if (a == "--colors") {
            if (v != "chart" && v != "swatch")
                return "colour set '" + v + "' is not chart or swatch";
            o.colorId = v == "chart" ? TreeTransformer::CHART_COLORS : TreeTransformer::SWATCH_COLORS;
            std::string list;
            if (!value(list))
                return "option '--colors' needs a list of colours after '" + v + "'";
            o.colors = split(list, ',');
        } else if (a == "--language") {
            const auto dash = v.find('-');
            o.language = v.substr(0, dash);
            o.country = dash == std::string::npos ? std::string() : v.substr(dash + 1);
            if (o.language->empty())
                return "language '" + v + "' has no language code";
        }
    }
    if (o.pmml.empty())
        return "no PMML file (--pmml FILE)";
    if (o.pmmlOut == "-" || o.compressedOut == "-")
        return "the display settings go to standard output; name a file for the model";
    return std::string();
}

bool read(const std::string& path, std::string& text, int& rc) {
    std::string error;
    if (readFile(path, text, error))
        return true;
    rc = failure(kTree, error);
    return false;
}

// The model must validate, or the library hands it back unchanged and the output would not be PMML.
bool validModel(const std::string& text, std::string& reason) {
    plotaid::detail::ValidatingParser parser;
    if (parser.parse(text, TreeTransformer::s_membufid, ChartException("PMML refused", "plotaid tree", 0),
                     plotaid::detail::DocumentKind::Pmml) != nullptr)
        return true;
    reason = parser.lastErrors().empty() ? "not valid PMML 2.1" : parser.lastErrors().front();
    return false;
}

int run(const Args& args) {
    if (wantsHelp(args)) {
        std::printf("usage: plotaid tree --pmml FILE [options]\n\n"
                    "Builds what the host's tree viewer receives for the decision tree in FILE (PMML 2.1,\n"
                    "plain or compressed): prints the display settings on standard output and writes\n"
                    "the model as asked.\n\n"
                    "options:\n"
                    "  --settings FILE              start from these display settings (default: built in)\n"
                    "  --template FILE              merge display settings from FILE\n"
                    "  --orientation top-down|left-to-right|right-to-left\n"
                    "  --zoom N                     zoom factor, 2 to 500\n"
                    "  --contents table|graph|both  what the nodes show\n"
                    "  --font NAME                  font family\n"
                    "  --colors chart|swatch C1,C2,...  colours such as #FF336699\n"
                    "  --language L[-C]             output language, optionally with a country\n"
                    "  --pmml-out FILE              write the model as a PMML document\n"
                    "  --compressed-pmml-out FILE   write the model compressed (zlib)\n"
                    "  -h, --help                   show this help\n");
        return kOk;
    }
    Options o;
    if (const std::string problem = parse(args, o); !problem.empty())
        return usageError(kTree, problem);

    int rc = kOk;
    std::string pmml, settings, templ;
    if (!read(o.pmml, pmml, rc) || (!o.settings.empty() && !read(o.settings, settings, rc)) ||
        (!o.templateFile.empty() && !read(o.templateFile, templ, rc)))
        return rc;
    if (!o.settings.empty() && settings.empty())
        return failure(kTree, "'" + o.settings + "' is empty");

    const bool compressed = !pmml.empty() && static_cast<unsigned char>(pmml[0]) == 0x78;
    const auto tree = compressed ? std::make_unique<TreeTransformer>(pmml, 0ul, settings)
                                 : std::make_unique<TreeTransformer>(pmml, settings);
    if (!o.templateFile.empty() && !tree->applyTemplate(templ))
        return failure(kTree, "'" + o.templateFile + "' is not valid display settings");
    if (o.orientation)
        tree->SetOrientation(*o.orientation);
    if (o.zoom)
        tree->SetZoomFactor(*o.zoom);
    if (o.contents)
        tree->SetTreeDisplayOption(*o.contents);
    if (o.font)
        tree->applyFont(*o.font);
    if (o.colorId)
        tree->applyColors(*o.colorId, o.colors);
    if (o.language)
        tree->SetOutputLanguage(*o.language, o.country);

    const std::string display = tree->getDisplayData(nullptr);
    if (display.empty())
        return failure(kTree, o.settings.empty() ? std::string("the display settings could not be built")
                                                 : "'" + o.settings + "' is not valid display settings");

    std::string error;
    if (!o.compressedOut.empty() && !writeFile(o.compressedOut, tree->getCompressedPMML(nullptr), error))
        return failure(kTree, error);
    if (!o.pmmlOut.empty()) {
        const std::string model = tree->getUncompressedPMML(nullptr);
        if (model.empty())
            return failure(kTree, "'" + o.pmml + "' cannot be decompressed");
        std::string reason;
        if (!validModel(model, reason))
            return failure(kTree, "'" + o.pmml + "' is not a valid PMML 2.1 tree: " + reason);
        if (!writeFile(o.pmmlOut, model, error))
            return failure(kTree, error);
    }
    std::fwrite(display.data(), 1, display.size(), stdout);
    return kOk;
}

const Registrar treeCommand({kTree, "display settings and PMML of a decision tree for the tree viewer", run});

} // namespace
} // namespace plotaid::tool

// plotaid template convert OLD [-o NEW]: writes a template of the earlier form in the current form.
#include "Command.h"

#include "foundation/XercesRuntime.h"
#include "templates/TemplateConverter.h"

#include <cstdio>
#include <string>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "template";

int run(const Args& args) {
    if (wantsHelp(args)) {
        std::printf(
            "usage: plotaid template convert OLD [-o NEW]\n\n"
            "Converts OLD, a template of the earlier form (a chart-grammar fragment such as hosts\n"
            "of the earlier release stored), into a template of the current form, one instruction\n"
            "per part of OLD that the converter recognises, and writes it to NEW (standard output\n"
            "when -o is not given or is \"-\"). A template with nothing recognisable converts to\n"
            "an empty template. This is the conversion that applying OLD does first.\n\n"
            "Exit status: 0 when OLD was converted, 1 when it is not XML, is already of the\n"
            "current form or is refused by the earlier form's grammar, 2 on a usage error.\n");
        return kOk;
    }
    if (args.empty() || args[0] != "convert")
        return usageError(kName, args.empty() ? "no action given (convert)" : "unknown action '" + args[0] + "'");
    std::string oldPath, outPath = "-";
    for (std::size_t i = 1; i < args.size(); ++i) {
        if ((args[i] == "-o" || args[i] == "--output") && i + 1 < args.size())
            outPath = args[++i];
        else if (oldPath.empty() && (args[i] == "-" || args[i].empty() || args[i][0] != '-'))
            oldPath = args[i];
        else
            return usageError(kName, "unexpected argument '" + args[i] + "'");
    }
    if (oldPath.empty())
        return usageError(kName, "no template given (convert OLD)");
    std::string text, error;
    if (!readFile(oldPath, text, error))
        return failure(kName, oldPath + ": " + error);
    const detail::XercesRuntime up;
    std::string converted;
    if (!detail::convertTemplateText(text, oldPath, converted, error))
        return failure(kName, error);
    if (!writeFile(outPath, converted, error))
        return failure(kName, outPath + ": " + error);
    return kOk;
}

const Registrar registrar({kName, "convert a template of the earlier form (template convert OLD [-o NEW])", run});

} // namespace
} // namespace plotaid::tool

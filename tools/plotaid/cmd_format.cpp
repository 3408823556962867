// plotaid format: the object-model format settings that a host print format turns into.
#include "Command.h"

#include "foundation/XercesRuntime.h"

#include <plotaid/ChartBase.h>
#include <plotaid/Kovar_Format.h>

#include <grx/GrxModel.h>
#include <kovar/kovarbase.h>
#include <kovar/kovarwin.h>
#include <xercesc/dom/DOM.hpp>

#include <cstdio>
#include <map>
#include <memory>
#include <string>

namespace plotaid::tool {
namespace {

constexpr const char* kName = "format";

void printHelp() {
    std::printf("usage: plotaid format --type N --width W --decimals D [--grouping] [--integer-digits N]\n\n"
                "Converts the host print format (type code N, width W, decimals D) as a chart would, and\n"
                "prints the settings of the resulting object-model format, one per line.\n"
                "--grouping          the host setting that plain numbers group their digits (default off)\n"
                "--integer-digits N  the host's minimum number of integer digits (default 1)\n"
                "Types: 3 comma, 4 dollar, 5 fixed, 17 scientific, 31 percent, 32 dot, 40 general,\n"
                "20-24 and 26-30, 38, 39 dates and times, 25 elapsed time, 33-37 custom currencies;\n"
                "others (1 and 2 are text) are left as they are.\n"
                "Exit status: 0 when the conversion succeeds, 1 when it fails, 2 on a usage error.\n");
}

bool number(const std::string& text, unsigned long max, unsigned long& out) {
    if (text.empty() || text.size() > 9 || text.find_first_not_of("0123456789") != std::string::npos)
        return false;
    out = std::stoul(text);
    return out <= max;
}

int run(const Args& args) {
    if (wantsHelp(args)) {
        printHelp();
        return kOk;
    }
    unsigned long type = 0, width = 0, decimals = 0, integerDigits = 1;
    bool haveType = false, haveWidth = false, haveDecimals = false, grouping = false;
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        if (a == "--grouping") {
            grouping = true;
            continue;
        }
        struct Numeric {
            const char* name;
            unsigned long max;
            unsigned long* value;
            bool* seen;
        };
        bool seenDigits = false;
        const Numeric options[] = {{"--type", 255, &type, &haveType},
                                   {"--width", 65535, &width, &haveWidth},
                                   {"--decimals", 255, &decimals, &haveDecimals},
                                   {"--integer-digits", 4294967295ul, &integerDigits, &seenDigits}};
        const Numeric* option = nullptr;
        for (const Numeric& o : options)
            if (a == o.name)
                option = &o;
        if (!option)
            return usageError(kName, "unknown argument '" + a + "'");
        if (i + 1 >= args.size())
            return usageError(kName, "option '" + a + "' needs a number");
        if (!number(args[++i], option->max, *option->value))
            return usageError(kName, "option '" + a + "' needs a whole number from 0 to " +
                                         std::to_string(option->max) + ", not '" + args[i] + "'");
        *option->seen = true;
    }
    if (!haveType || !haveWidth || !haveDecimals)
        return usageError(kName, "--type, --width and --decimals are all needed");

    detail::XercesRuntime runtime;
    if (!runtime.ready())
        return failure(kName, "the XML runtime could not be started");
    kovar::setDigitGrouping(grouping);
    kovar::setMinIntegerDigits(static_cast<std::uint32_t>(integerDigits));

    const Kovar_Format host(static_cast<std::uint8_t>(type), static_cast<std::uint16_t>(width),
                            static_cast<std::uint8_t>(decimals));
    xercesc::DOMImplementation* impl = xercesc::DOMImplementationRegistry::getDOMImplementation(u"LS");
    GrxVisualization vis(
        impl->createDocument(u"http://plotaid.org/grxml", u"visualization", nullptr)->getDocumentElement(),
        true);
    GrxFormat& format = vis.addSourceVariable().addFormat();
    const bool converted = ChartBase::addFormat(format, host);

    std::printf("host format: type %u, width %u, decimals %u\n", host.GetType(), host.GetWidth(),
                host.GetDecimals());
    std::map<std::string, std::string> settings;
    const xercesc::DOMNamedNodeMap* attributes = format.getImplementation()->getAttributes();
    for (XMLSize_t i = 0; i < attributes->getLength(); ++i)
        settings[ChartString(attributes->item(i)->getNodeName()).toUTF8()] =
            ChartString(attributes->item(i)->getNodeValue()).toUTF8();
    for (const auto& [name, value] : settings)
        std::printf("  %s = \"%s\"\n", name.c_str(), value.c_str());
    std::fflush(stdout);
    return converted ? kOk : failure(kName, "the format could not be converted");
}

const Registrar registrar({kName, "object-model format settings of a host print format", run});

} // namespace
} // namespace plotaid::tool

#ifndef PLOTAID_CHARTBASE_H
#define PLOTAID_CHARTBASE_H

#include <plotaid/Export.h>

#include <string>

class GrxFormat;
class Kovar_Format;

// Base of the library's document builders.
class PLOTAID_API ChartBase {
public:
    // Debug dump kinds. Kind n is switched on by character n of "DumpChartXMLOptions" (any
    // character but '0'); dumps go to the folder named by "DumpChartXMLPath".
    enum PRINTTYPE {
        PRINT_UNUSED_0 = 0,
        PRINT_UNUSED_1 = 1,
        PRINT_UNUSED_2 = 2,
        PRINT_CONVERTED_TEMPLATE = 3,  // "template_converted_" .sgt
        PRINT_TEMPLATE = 4,            // "Template_" .sgt
        PRINT_XML_BEFORE_TEMPLATE = 5, // "Xml_before_template_" .xml
        PRINT_XML_AFTER_TEMPLATE = 6,  // "Xml_after_template_" .xml
        PRINT_UNUSED_7 = 7,
        PRINT_UNUSED_8 = 8,
        PRINT_XML_WITH_POPUPS = 9 // "xml_with_popups" .xml, and "parseError_" .xml for rejected text
    };

    // Writes text to <DumpChartXMLPath>/<name><count, two digits at least><extension>, replacing
    // any earlier file. False when the kind is off, the text is empty or the file cannot be written.
    static bool printString(const std::string& text, const std::string& name, const std::string& extension,
                            int count, int kind);
    // Whether dumps of the kind are switched on; always false for kinds outside 0-9.
    static bool willPrintString(int kind);
    // Appends a timing line to <DumpChartTimePath>/chartxmldebug_<Mon><dd>00.txt when that variable
    // is set. The log is fixed at the first call of the process.
    static void printDebugInfo(const std::string& text);

    // Host print formats to object-model formats, so chart labels print as the host's output does.
    // addFormat dispatches by type and leaves types it does not convert alone (true); the others
    // give false for a type outside their own.
    static bool addFormat(GrxFormat& format, const Kovar_Format& hostFormat);
    static bool FormatNumber(GrxFormat& format, const Kovar_Format& hostFormat);
    static bool FormatDate(GrxFormat& format, const Kovar_Format& hostFormat);
    static bool FormatElapsedTime(GrxFormat& format, const Kovar_Format& hostFormat);
    static bool FormatCustomCurrency(GrxFormat& format, const Kovar_Format& hostFormat);
};

#endif

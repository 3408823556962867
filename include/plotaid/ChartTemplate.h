#ifndef PLOTAID_CHARTTEMPLATE_H
#define PLOTAID_CHARTTEMPLATE_H

#include <plotaid/Export.h>

#include <xercesc/util/XercesDefs.hpp>

#include <memory>
#include <string>

XERCES_CPP_NAMESPACE_BEGIN
class DOMElement;
XERCES_CPP_NAMESPACE_END

class GrxVisualization;

// Applies a chart template to a visualization: construct, setTemplate, applyTemplate, destroy.
// The template's instructions edit the target in document order, each seeing the changes of the
// ones before it. Templates of the earlier form are converted first.
class PLOTAID_API ChartTemplate {
public:
    // `source`, when given, is the chart as its own definition built it; what it sets explicitly
    // is left alone.
    ChartTemplate(GrxVisualization& target, GrxVisualization* source);
    ~ChartTemplate();
    ChartTemplate(const ChartTemplate&) = delete;
    ChartTemplate& operator=(const ChartTemplate&) = delete;

    // Parses (with validation) and keeps the template; false, logged, when it cannot be parsed.
    bool setTemplate(const std::string& text);
    // Applies every instruction of the kept template, if any, and returns the target. A fatal
    // failure is logged and thrown as a ChartException; the host's KovarGoToCaller passes through.
    GrxVisualization& applyTemplate();

protected:
    XERCES_CPP_NAMESPACE::DOMElement* parseTemplate(const std::string& text);

private:
    GrxVisualization& target_;
    GrxVisualization* source_;
    struct Parser;
    std::unique_ptr<Parser> parser_;
    XERCES_CPP_NAMESPACE::DOMElement* root_ = nullptr;
};

#endif

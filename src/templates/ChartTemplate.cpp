// Template loading: parse with validation, convert the earlier form, hand the root to the walk.
#include <plotaid/ChartTemplate.h>

#include "foundation/ValidatingParser.h"
#include "templates/InstructionWalk.h"
#include "templates/TemplateConverter.h"

#include <plotaid/ChartBase.h>
#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>

#include <kovar/KovarGoToCaller.h>

#include <xercesc/dom/DOM.hpp>

using namespace XERCES_CPP_NAMESPACE;

namespace {

const char* const kFile = "backend/chartxml/plotaid/src/templates/charttemplate";
// Current-form templates name a schema file starting with this; any other text is earlier-form.
const char* const kCurrentFormMarker = "grxml-template-";

} // namespace

struct ChartTemplate::Parser {
    plotaid::detail::ValidatingParser parser;
    // The document of the kept root; the one before it dies when it is replaced.
    plotaid::detail::OwnedDocument document;
    // Whether the last parse already logged that the template could not be parsed.
    bool failureLogged = false;
};

ChartTemplate::ChartTemplate(GrxVisualization& target, GrxVisualization* source)
    : target_(target), source_(source), parser_(std::make_unique<Parser>()) {}

ChartTemplate::~ChartTemplate() {
    root_ = nullptr;
}

DOMElement* ChartTemplate::parseTemplate(const std::string& text) {
    const bool currentForm = text.find(kCurrentFormMarker) != std::string::npos;
    DOMDocument* parsed = parser_->parser.parse(
        text, "ChartTemplate",
        ChartException(
            (currentForm ? "Failed to parse template " : "Failed to parse earlier-form template ") + text,
            kFile, 59));
    parser_->failureLogged = currentForm && parsed == nullptr;
    if (!currentForm) {
        // The converted text always carries the marker, so this recursion ends here.
        const std::string converted = plotaid::detail::convertTemplate(parsed);
        ChartBase::printString(converted, "template_converted_", ".sgt",
                               plotaid::detail::nextConversionCount(), ChartBase::PRINT_CONVERTED_TEMPLATE);
        if (converted.find(kCurrentFormMarker) == std::string::npos)
            return nullptr;
        return parseTemplate(converted);
    }
    if (parsed == nullptr)
        return nullptr;
    DOMElement* root = parsed->getDocumentElement();
    parser_->document = parser_->parser.adoptDocument();
    return root;
}

bool ChartTemplate::setTemplate(const std::string& text) {
    try {
        root_ = nullptr;
        parser_->document.reset();
        root_ = parseTemplate(text);
        if (root_ != nullptr)
            return true;
        if (!parser_->failureLogged)
            ChartErrorHandler().error(ChartException("Failed to parse template " + text, kFile, 59));
        return false;
    } catch (const KovarGoToCaller&) {
        throw;
    } catch (...) {
        const ChartException fatal("Fatal Error occurred while applying template " + text, kFile, 74);
        ChartErrorHandler().error(fatal);
        throw fatal;
    }
}

GrxVisualization& ChartTemplate::applyTemplate() {
    if (root_ == nullptr)
        return target_;
    try {
        plotaid::detail::applyTemplateCommands(source_, target_, root_);
    } catch (const KovarGoToCaller&) {
        throw;
    } catch (...) {
        const ChartException fatal("Fatal Error occurred while applying template", kFile, 102);
        ChartErrorHandler().error(fatal);
        throw fatal;
    }
    return target_;
}

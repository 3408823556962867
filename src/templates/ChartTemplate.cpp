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
// The converted text always names this grammar.
const char* const kConvertedGrammar = "grxml-template-1.0.xsd";

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
    using plotaid::detail::DocumentKind;
    std::string notXml;
    const DocumentKind kind = plotaid::detail::templateKind(text, notXml);
    parser_->failureLogged = false;
    // Text that is not XML is no template of any form, so there is nothing to convert.
    if (!notXml.empty())
        return nullptr;
    const bool currentForm = kind != DocumentKind::Named;
    plotaid::detail::ValidatingParser& parser = parser_->parser;
    DOMDocument* parsed = parser.parse(
        text, "ChartTemplate",
        ChartException(
            (currentForm ? "Failed to parse template " : "Failed to parse earlier-form template ") + text,
            kFile, 59),
        kind);
    parser_->failureLogged = currentForm && parsed == nullptr;
    if (!currentForm) {
        // The converted text is read as the current form, so this recursion ends here.
        // A parse that stopped early hands on what it built.
        const std::string converted =
            plotaid::detail::convertTemplate(parsed ? parsed : parser.partialDocument());
        ChartBase::printString(converted, "template_converted_", ".sgt",
                               plotaid::detail::nextConversionCount(), ChartBase::PRINT_CONVERTED_TEMPLATE);
        if (converted.find(kConvertedGrammar) == std::string::npos)
            return nullptr;
        return parseTemplate(converted);
    }
    if (parsed == nullptr)
        return nullptr;
    DOMElement* root = parsed->getDocumentElement();
    parser_->document = parser.adoptDocument();
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

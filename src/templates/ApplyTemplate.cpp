// The instruction walk: each instruction of a template becomes one action, applied at once.
#include "templates/InstructionWalk.h"

#include "foundation/RecordSink.h"
#include "templates/actions/Actions.h"

#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>

#include <grx/ChartPrinter.h>
#include <grx/ChartString.h>

#include <kovar/KovarGoToCaller.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLException.hpp>
#include <xercesc/util/XMLString.hpp>

#include <optional>
#include <sstream>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

const char* const kFile = "backend/chartxml/plotaid/src/templates/applytemplate";

// Tested in this order, first match wins; a null factory is a class not built yet.
const InstructionEntry kInstructions[] = {
    {u"setStyle", "TStyle", makeAction<TStyle>},
    {u"addFrame", "TAddFrame", nullptr},
    {u"addHistogramSummaryFrame", "TAddHistogramSummaryFrame", nullptr},
    {u"addImage", "TAddImage", makeAction<TAddImage>},
    {u"setColor", "TSetColor", makeAction<TSetColor>},
    {u"setDash", "TSetDash", makeAction<TSetDash>},
    {u"setPattern", "TSetPattern", makeAction<TSetPattern>},
    {u"setShape", "TSetShape", makeAction<TSetShape>},
    {u"setSize", "TSetSize", makeAction<TSetSize>},
    {u"setStyleCycle", "TStyleCycle", nullptr},
    {u"setAxisScale", "TSetAxisScale", nullptr},
    {u"setAxisInterval", "TSetAxisInterval", nullptr},
    {u"setAxisMargin", "TSetAxisMargin", nullptr},
    {u"setAxisStyle", "TSetAxisStyle", nullptr},
    {u"setAxisMajorTicks", "TSetAxisMajorTicks", nullptr},
    {u"setAxisMinorTicks", "TSetAxisMinorTicks", nullptr},
    {u"setBackPlane", "TSetBackPlane", nullptr},
    {u"setWireFrame", "TSetWireFrame", nullptr},
    {u"addReferenceLine", "TReferenceLine", nullptr},
    {u"addReferenceRectangle", "TReferenceRectangle", nullptr},
    {u"addAnchoredAnnotation", "TAnchoredAnnotation", nullptr},
    {u"addFitLine", "TFitLine", nullptr},
    {u"addHistogramNormalLine", "THistogramNormalLine", nullptr},
    {u"addInterpolationLine", "TInterpolationLine", nullptr},
    {u"setWrapPanels", "TSetWrapPanels", nullptr},
    {u"setAxisOpposite", "TSetAxisOpposite", nullptr},
    {u"addDerivedAxis", "TAddDerivedAxis", nullptr},
    {u"addOriginLine", "TAddOriginLine", nullptr},
    {u"addBarEffects", "TAddBarEffects", nullptr},
    {u"addPieEffects", "TAddPieEffects", nullptr},
    {u"addPopups", "TAddPopups", nullptr},
    {u"addDrillDown", "TAddDrilldowns", nullptr},
    {u"addShadow", "TShadowEffects", nullptr},
    {u"addDash", "TAddDash", makeAction<TAddDash>},
    {u"addDataLabels", "TAddDataLabels", nullptr},
    {u"setScaleByFraction", "TSetScaleByFraction", nullptr},
    {u"setTranspose", "TSetTranspose", nullptr},
    {u"setPieTranspose", "TSetPieTranspose", nullptr},
    {u"setPanelOptions", "TSetPanelOptions", nullptr},
    {u"setRotation", "TSetRotation", nullptr},
    {u"setTickLabelFormat", "TSetTickLabelFormat", nullptr},
    {u"setCategorySorting", "TSetCategorySorting", nullptr},
    {u"setCollapse", "TSetCollapse", nullptr},
    {u"setClusterWidth", "TSetClusterWidth", nullptr},
    {u"setExclude", "TSetExclude", nullptr},
    {u"setOrder", "TSetOrder", nullptr},
    {u"setExplodeSlice", "TSetExplodeSlice", nullptr},
    {u"setProjectionLine", "TSetProjectionLine", nullptr},
    {u"setTickLabelAngle", "TSetTickLabelAngle", nullptr},
    {u"addSpikes", "TAddSpikes", nullptr},
    {u"addStyleCycle", "TAddStyleCycle", nullptr},
    {u"setTickLabelFrequency", "TSetTickLabelFrequency", nullptr},
    {u"setHistogramBinning", "THistogramBinning", nullptr},
    {u"setScatterplotBinning", "TSetScatterplotBinning", nullptr},
    {u"hideFrame", "THideFrame", nullptr},
    {u"setShowLineMarkers", "TSetShowLineMarkers", makeAction<TSetShowLineMarkers>},
    {u"setErrorBarOptions", "TSetErrorBarOptions", nullptr},
    {u"addChartsOnDiagonal", "TAddChartsOnDiagonal", nullptr},
    {u"setGenericAttributes", "TSetGenericAttributes", makeAction<TSetGenericAttributes>},
};

thread_local WalkReport* currentReport = nullptr;
thread_local ScopedInstructionTable* currentTable = nullptr;

std::string printed(const DOMNode* node) {
    try {
        std::ostringstream out;
        ChartPrinter().Print(node, out);
        return out.str();
    } catch (...) {
        return ChartString(node->getNodeName()).toUTF8();
    }
}

const InstructionEntry* find(const InstructionTable& table, const XMLCh* tag) {
    for (std::size_t i = 0; i < table.count; ++i)
        if (XMLString::equals(table.entries[i].tag, tag))
            return &table.entries[i];
    return nullptr;
}

std::string firstError(const RecordCollector& records) {
    for (const LogRecord& record : records.records())
        if (record.isError())
            return record.message;
    return std::string();
}

} // namespace

InstructionTable instructionTable() noexcept {
    return {kInstructions, sizeof kInstructions / sizeof kInstructions[0]};
}

ScopedInstructionTable::ScopedInstructionTable(InstructionTable table) noexcept
    : table_(table), outer_(currentTable) {
    currentTable = this;
}

ScopedInstructionTable::~ScopedInstructionTable() {
    currentTable = outer_;
}

InstructionTable ScopedInstructionTable::active() noexcept {
    return currentTable != nullptr ? currentTable->table_ : instructionTable();
}

WalkReport::WalkReport() noexcept : outer_(currentReport) {
    currentReport = this;
}

WalkReport::~WalkReport() {
    currentReport = outer_;
}

WalkReport* WalkReport::current() noexcept {
    return currentReport;
}

void WalkReport::add(InstructionOutcome outcome) {
    outcomes_.push_back(std::move(outcome));
}

void applyTemplateCommands(const GrxVisualization* source, GrxVisualization& target, const DOMElement* root,
                           InstructionTable table) {
    if (root == nullptr)
        return;
    FrameList frames;
    unsigned position = 0;
    for (const DOMNode* node = root->getFirstChild(); node != nullptr; node = node->getNextSibling()) {
        if (node->getNodeType() != DOMNode::ELEMENT_NODE)
            continue;
        const auto* instruction = static_cast<const DOMElement*>(node);
        ++position;
        WalkReport* report = WalkReport::current();
        // Only a report pays for collecting what the instruction logged.
        std::optional<RecordCollector> records;
        if (report != nullptr)
            records.emplace();
        const auto note = [&](InstructionOutcome::Kind kind, std::string reason) {
            if (report != nullptr)
                report->add(
                    {position, ChartString(instruction->getTagName()).toUTF8(), kind, std::move(reason)});
        };

        std::unique_ptr<BaseTemplate> action;
        try {
            const InstructionEntry* entry = find(table, instruction->getTagName());
            if (entry == nullptr || entry->make == nullptr) {
                ChartErrorHandler().error(ChartException(
                    "Unsupported Template element encountered (" + printed(instruction) + ")", kFile, 436));
                note(InstructionOutcome::Unsupported, std::string());
                continue;
            }
            action = entry->make(source, target, instruction, frames);
        } catch (const KovarGoToCaller&) {
            throw;
        } catch (const XMLException& e) {
            ChartErrorHandler().error(e);
            note(InstructionOutcome::Failed, ChartString(e.getMessage()).toUTF8());
            continue;
        } catch (const DOMException& e) {
            note(InstructionOutcome::Failed, ChartString(e.getMessage()).toUTF8());
            ChartErrorHandler().error(e); // throws: a broken DOM ends the walk
            throw;
        } catch (...) {
            const ChartException fatal(
                "Fatal Error occurred while applying template command: " + printed(instruction), kFile, 483);
            ChartErrorHandler().error(fatal);
            note(InstructionOutcome::Failed, fatal.what());
            throw fatal;
        }
        if (action == nullptr) {
            note(InstructionOutcome::Failed, "the action could not be made");
            continue;
        }

        // An action's own failure costs only its own instruction.
        std::string thrown;
        bool applied = false;
        try {
            applied = action->apply();
        } catch (const KovarGoToCaller&) {
            throw;
        } catch (const std::exception& e) {
            thrown = e.what();
        } catch (const XMLException& e) {
            thrown = ChartString(e.getMessage()).toUTF8();
        } catch (const DOMException& e) {
            thrown = ChartString(e.getMessage()).toUTF8();
        } catch (...) {
            thrown = "unknown exception";
        }
        action.reset();
        if (report == nullptr)
            continue;
        std::string reason = firstError(*records);
        if (reason.empty() && !thrown.empty())
            reason = thrown;
        if (reason.empty() && !applied)
            reason = "the action reported that it changed nothing";
        if (!thrown.empty() && reason != thrown)
            reason += " (then threw: " + thrown + ")";
        note(reason.empty() ? InstructionOutcome::Applied : InstructionOutcome::Failed, reason);
    }
}

} // namespace plotaid::detail

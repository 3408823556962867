// The instruction walk: each instruction of a template becomes one action, applied at once.
#include "templates/InstructionWalk.h"

#include "foundation/RecordSink.h"
#include "templates/Kit.h"

#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>

#include <grx/ChartString.h>

#include <kovar/KovarGoToCaller.h>

#include <xercesc/dom/DOM.hpp>
#include <xercesc/util/XMLException.hpp>
#include <xercesc/util/XMLString.hpp>

#include <cstring>
#include <optional>

using namespace XERCES_CPP_NAMESPACE;

namespace plotaid::detail {

namespace {

const char* const kFile = "backend/chartxml/plotaid/src/templates/applytemplate";

// Tested in this order, first match wins. The factories come from the families' own rows.
struct InstructionName {
    const XMLCh* tag;
    const char* actionClass;
};

const InstructionName kInstructions[] = {
    {u"setStyle", "TStyle"},
    {u"addFrame", "TAddFrame"},
    {u"addHistogramSummaryFrame", "TAddHistogramSummaryFrame"},
    {u"addImage", "TAddImage"},
    {u"setColor", "TSetColor"},
    {u"setDash", "TSetDash"},
    {u"setPattern", "TSetPattern"},
    {u"setShape", "TSetShape"},
    {u"setSize", "TSetSize"},
    {u"setStyleCycle", "TStyleCycle"},
    {u"setAxisScale", "TSetAxisScale"},
    {u"setAxisInterval", "TSetAxisInterval"},
    {u"setAxisMargin", "TSetAxisMargin"},
    {u"setAxisStyle", "TSetAxisStyle"},
    {u"setAxisMajorTicks", "TSetAxisMajorTicks"},
    {u"setAxisMinorTicks", "TSetAxisMinorTicks"},
    {u"setBackPlane", "TSetBackPlane"},
    {u"setWireFrame", "TSetWireFrame"},
    {u"addReferenceLine", "TReferenceLine"},
    {u"addReferenceRectangle", "TReferenceRectangle"},
    {u"addAnchoredAnnotation", "TAnchoredAnnotation"},
    {u"addFitLine", "TFitLine"},
    {u"addHistogramNormalLine", "THistogramNormalLine"},
    {u"addInterpolationLine", "TInterpolationLine"},
    {u"setWrapPanels", "TSetWrapPanels"},
    {u"setAxisOpposite", "TSetAxisOpposite"},
    {u"addDerivedAxis", "TAddDerivedAxis"},
    {u"addOriginLine", "TAddOriginLine"},
    {u"addBarEffects", "TAddBarEffects"},
    {u"addPieEffects", "TAddPieEffects"},
    {u"addPopups", "TAddPopups"},
    {u"addDrillDown", "TAddDrilldowns"},
    {u"addShadow", "TShadowEffects"},
    {u"addDash", "TAddDash"},
    {u"addDataLabels", "TAddDataLabels"},
    {u"setScaleByFraction", "TSetScaleByFraction"},
    {u"setTranspose", "TSetTranspose"},
    {u"setPieTranspose", "TSetPieTranspose"},
    {u"setPanelOptions", "TSetPanelOptions"},
    {u"setRotation", "TSetRotation"},
    {u"setTickLabelFormat", "TSetTickLabelFormat"},
    {u"setCategorySorting", "TSetCategorySorting"},
    {u"setCollapse", "TSetCollapse"},
    {u"setClusterWidth", "TSetClusterWidth"},
    {u"setExclude", "TSetExclude"},
    {u"setOrder", "TSetOrder"},
    {u"setExplodeSlice", "TSetExplodeSlice"},
    {u"setProjectionLine", "TSetProjectionLine"},
    {u"setTickLabelAngle", "TSetTickLabelAngle"},
    {u"addSpikes", "TAddSpikes"},
    {u"addStyleCycle", "TAddStyleCycle"},
    {u"setTickLabelFrequency", "TSetTickLabelFrequency"},
    {u"setHistogramBinning", "THistogramBinning"},
    {u"setScatterplotBinning", "TSetScatterplotBinning"},
    {u"hideFrame", "THideFrame"},
    {u"setShowLineMarkers", "TSetShowLineMarkers"},
    {u"setErrorBarOptions", "TSetErrorBarOptions"},
    {u"addChartsOnDiagonal", "TAddChartsOnDiagonal"},
    {u"setGenericAttributes", "TSetGenericAttributes"},
};

std::vector<InstructionEntry>& registry() {
    static std::vector<InstructionEntry> rows;
    return rows;
}

thread_local WalkReport* currentReport = nullptr;
thread_local ScopedInstructionTable* currentTable = nullptr;

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

ActionFamily::ActionFamily(std::initializer_list<InstructionEntry> rows) {
    registry().insert(registry().end(), rows.begin(), rows.end());
}

const std::vector<InstructionEntry>& registeredActions() noexcept {
    return registry();
}

InstructionTable instructionTable() noexcept {
    // Joined once, after every family registered itself during static initialisation.
    static const std::vector<InstructionEntry> joined = [] {
        std::vector<InstructionEntry> table;
        for (const InstructionName& name : kInstructions) {
            InstructionEntry entry{name.tag, name.actionClass, nullptr};
            for (const InstructionEntry& row : registry())
                if (XMLString::equals(row.tag, name.tag) && std::strcmp(row.actionClass, name.actionClass) == 0)
                    entry.make = row.make;
            table.push_back(entry);
        }
        return table;
    }();
    return {joined.data(), joined.size()};
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
        const bool resultCarriesNothing = dynamic_cast<const ResultCarriesNothing*>(action.get()) != nullptr;
        action.reset();
        if (report == nullptr)
            continue;
        std::string reason = firstError(*records);
        if (reason.empty() && !thrown.empty())
            reason = thrown;
        if (reason.empty() && !applied && !resultCarriesNothing)
            reason = "the action reported that it changed nothing";
        if (!thrown.empty() && reason != thrown)
            reason += " (then threw: " + thrown + ")";
        note(reason.empty() ? InstructionOutcome::Applied : InstructionOutcome::Failed, reason);
    }
}

} // namespace plotaid::detail

#ifndef PLOTAID_TEMPLATES_INSTRUCTIONWALK_H
#define PLOTAID_TEMPLATES_INSTRUCTIONWALK_H

#include <plotaid/BaseTemplate.h>

#include <xercesc/util/XercesDefs.hpp>

#include <cstddef>
#include <initializer_list>
#include <memory>
#include <string>
#include <vector>

XERCES_CPP_NAMESPACE_BEGIN
class DOMElement;
XERCES_CPP_NAMESPACE_END

class GrxBaseElement;
class GrxVisualization;

namespace plotaid::detail {

// Frames that "addFrame" instructions placed, kept for the later ones of the same template.
using FrameList = std::vector<GrxBaseElement*>;

using ActionFactory = std::unique_ptr<BaseTemplate> (*)(const GrxVisualization* source,
                                                        GrxVisualization& target,
                                                        const XERCES_CPP_NAMESPACE::DOMElement* instruction,
                                                        FrameList& frames);

// One instruction tag and the action class that carries it out. `make` is null while that class
// has not been built: the walk then reports the tag exactly as an unknown one.
struct InstructionEntry {
    const XMLCh* tag;
    const char* actionClass;
    ActionFactory make;
};

struct InstructionTable {
    const InstructionEntry* entries;
    std::size_t count;
};

// The 59 instruction tags, in the order the walk tests them, each with the factory its family
// registered (null while no family carries the tag out).
InstructionTable instructionTable() noexcept;

// A family's rows of the walk's table. Each family source holds one at namespace scope, so adding
// a family touches only its own files; a row whose tag and class name are not one of the 59 pairs
// is never dispatched.
class ActionFamily {
public:
    ActionFamily(std::initializer_list<InstructionEntry> rows);
};

// Every row the families registered, in registration order.
const std::vector<InstructionEntry>& registeredActions() noexcept;

// While one lives, walks on this thread use `table` instead of the 59 tags (for trying actions
// out, and for tests of the walk's failure handling).
class ScopedInstructionTable {
public:
    explicit ScopedInstructionTable(InstructionTable table) noexcept;
    ~ScopedInstructionTable();
    ScopedInstructionTable(const ScopedInstructionTable&) = delete;
    ScopedInstructionTable& operator=(const ScopedInstructionTable&) = delete;

    // The table in force on this thread.
    static InstructionTable active() noexcept;

private:
    InstructionTable table_;
    ScopedInstructionTable* outer_;
};

// Marks an action whose apply() answers false whatever it did: the walk then reports it applied
// unless it logged an error, rather than as having changed nothing.
struct ResultCarriesNothing {};

// What became of one instruction, for a template author.
struct InstructionOutcome {
    enum Kind { Applied, Unsupported, Failed };
    unsigned position; // among the root's element children, from 1
    std::string tag;
    Kind kind;
    std::string reason; // for Failed: the first error the instruction reported, or what it threw
};

// While one lives on a thread, every walk on that thread appends an outcome per instruction.
// Without one the walk collects nothing.
class WalkReport {
public:
    WalkReport() noexcept;
    ~WalkReport();
    WalkReport(const WalkReport&) = delete;
    WalkReport& operator=(const WalkReport&) = delete;

    const std::vector<InstructionOutcome>& outcomes() const noexcept { return outcomes_; }
    void clear() noexcept { outcomes_.clear(); }

    static WalkReport* current() noexcept;
    void add(InstructionOutcome outcome);

private:
    std::vector<InstructionOutcome> outcomes_;
    WalkReport* outer_;
};

// Applies each element child of `root` as one instruction, in document order. An unknown tag is
// logged and skipped, an action's own failure swallowed; a DOM fault or any other fault while an
// action is made ends the walk with an exception, and the host's KovarGoToCaller passes through.
void applyTemplateCommands(const GrxVisualization* source, GrxVisualization& target,
                           const XERCES_CPP_NAMESPACE::DOMElement* root,
                           InstructionTable table = ScopedInstructionTable::active());

} // namespace plotaid::detail

#endif

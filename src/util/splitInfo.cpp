#include <plotaid/splitInfo.h>

#include <feed/corekit.h>
#include <feed/feed.h>
#include <kovar/KovarGoToCaller.h>
#include <kovar/kovarconv.h>
#include <msgbook/FacSTDictionary.h>
#include <scratchloc/PathFactory.h>

#include <cstring>
#include <memory>
#include <new>
#include <vector>

namespace plotaid::detail {
namespace {

const char* const kBlankValueMessage = "E60712";

struct SplitEntry {
    std::string name;
    std::string label;
    std::string valueText;
    int index = 0;
    feed::OBS value{};
};

std::string resourceFolder() {
    const scratchloc::PathFinder* finder = scratchloc::PathFactory::getPathInstance(3);
    return finder ? finder->getPath() : std::string();
}

std::string trimBlanksAndTabs(const std::string& text) {
    const std::size_t first = text.find_first_not_of(" \t");
    if (first == std::string::npos)
        return std::string();
    return text.substr(first, text.find_last_not_of(" \t") - first + 1);
}

// The characters of a text value, as many as the width allows and the case holds.
std::string textValue(const feed::OBS* cells, unsigned cellCount, std::size_t width) {
    const std::size_t available = static_cast<std::size_t>(cellCount) * sizeof(feed::OBS);
    const std::size_t n = width < available ? width : available;
    std::string text(n, ' ');
    for (std::size_t i = 0; i < n; ++i)
        text[i] = cells[i / sizeof(feed::OBS)].text[i % sizeof(feed::OBS)];
    const std::size_t last = text.find_last_not_of(' ');
    text.erase(last == std::string::npos ? 0 : last + 1);
    return text;
}

} // namespace
} // namespace plotaid::detail

using namespace plotaid::detail;

struct splitInfo::Impl {
    Impl() : dictionary(resourceFolder()) {}

    bool readEntry(const feed::ProcDSIterator& cases, const feed::ProcedureDataSource& source, int i,
                   SplitEntry& entry) const {
        entry.index = source.GetSplitVariableIndex(i);
        const feed::Kovar_Variable* variable = source.GetVariable(entry.index);
        if (!variable || entry.index < 0)
            return false;
        const unsigned index = static_cast<unsigned>(entry.index);
        const feed::OBS* cells = cases.GetObsPointer(index);
        const unsigned cellCount = cells ? cases.GetObsCount(index) : 0;
        if (cellCount == 0)
            return false;

        entry.name = variable->GetName();
        entry.label = variable->GetLabel();
        if (entry.label.empty())
            entry.label = entry.name;
        entry.value = cells[0];

        const Kovar_Format format = variable->GetFormat();
        const feed::Kovar_ValueLabelMap* labels = variable->GetValueLabels();
        // Both text types hold characters; reading them as a number would print noise.
        if (format.IsString()) {
            const std::string text = textValue(cells, cellCount, format.GetWidth());
            if (labels && labels->GetLabel(text, entry.valueText))
                return true;
            entry.valueText = text.empty() ? dictionary.LookUp(kBlankValueMessage) : text;
            return true;
        }
        if (labels && labels->GetLabel(entry.value.number, entry.valueText))
            return true;
        if (variable->IsMissing(entry.value.number) == 1) {
            entry.valueText = dictionary.LookUp(kBlankValueMessage);
            return true;
        }
        std::string printed;
        kovar::ToString(entry.value.number, format, printed);
        entry.valueText = trimBlanksAndTabs(printed.substr(0, format.GetWidth()));
        return true;
    }

    msgbook::FacSTDictionary dictionary;
    std::vector<SplitEntry> entries;
    const feed::ProcedureDataSource* source = nullptr;
};

splitInfo::splitInfo() : impl_(new Impl) {}

splitInfo::~splitInfo() {
    delete impl_;
}

bool splitInfo::saveSplitInfo(feed::ProcDSIterator* cases, const feed::ProcedureDataSource* source) {
    impl_->source = source;
    if (!source)
        return true;
    // Each call describes one split group: a new group replaces the old one rather than
    // lengthening its label.
    impl_->entries.clear();
    if (!cases)
        return true;
    const int count = source->GetSplitVariableCount();
    for (int i = 0; i < count; ++i) {
        try {
            SplitEntry entry;
            if (impl_->readEntry(*cases, *source, i, entry))
                impl_->entries.push_back(std::move(entry));
        } catch (const KovarGoToCaller&) {
            throw; // the host unwinding to its caller, not a failure of this variable
        } catch (...) {
            // One unreadable split variable must not cost the others.
        }
    }
    return true;
}

std::string splitInfo::getSplitLabel(bool useNames) const {
    try {
        std::string label;
        bool first = true;
        for (const SplitEntry& entry : impl_->entries) {
            if (!first)
                label += ", ";
            first = false;
            label += useNames ? entry.name : entry.label;
            label += " = ";
            label += entry.valueText;
        }
        return label;
    } catch (...) {
        return std::string();
    }
}

feed::BpHeading* splitInfo::activateSplit(feed::BpProcedure& procedure) const {
    const feed::ProcedureDataSource* source = impl_->source;
    try {
        if (!source || !source->UsesSplitHeading(procedure))
            return nullptr;
        feed::BpComposite composite("[%1 = %2:, ^1 = ^2:]1", false);
        for (const SplitEntry& entry : impl_->entries) {
            const feed::Kovar_Variable* variable = source->GetVariable(entry.index);
            if (!variable)
                continue;
            composite.Sublist();
            composite.Add(std::make_unique<feed::BpVariable>(*variable, 2));
            composite.Add(std::make_unique<feed::BpDataValue>(*variable, entry.value, 2));
            composite.EndSublist();
        }
        return new feed::BpHeading(procedure.Heading(composite));
    } catch (const KovarGoToCaller&) {
        throw;
    } catch (...) {
        return nullptr;
    }
}

#include <feed/corekit.h>

#include <kovar/kovarconv.h>

#include <cstring>

namespace feed {

namespace {

std::string trimmed(std::string text) {
    const std::size_t first = text.find_first_not_of(" \t");
    if (first == std::string::npos)
        return std::string();
    const std::size_t last = text.find_last_not_of(" \t");
    return text.substr(first, last - first + 1);
}

} // namespace

BpVariable::BpVariable(const Kovar_Variable& variable, int showMode)
    : name_(variable.GetName()), label_(variable.GetLabel()), showMode_(showMode) {}

std::string BpVariable::Text() const {
    switch (showMode_) {
    case 2:
        return label_.empty() ? name_ : label_;
    case 3:
        return label_.empty() ? name_ : name_ + " " + label_;
    default:
        return name_;
    }
}

BpDataValue::BpDataValue(const Kovar_Variable& variable, const OBS& value, int preference) {
    const Kovar_Format format = variable.GetFormat();
    const Kovar_ValueLabelMap* labels = preference == 2 ? variable.GetValueLabels() : nullptr;
    if (format.IsString()) {
        // Only the one cell is known here: at most eight characters.
        std::size_t n = format.GetWidth() < sizeof value.text ? format.GetWidth() : sizeof value.text;
        std::string text(value.text, n);
        while (!text.empty() && text.back() == ' ')
            text.pop_back();
        if (!labels || !labels->GetLabel(text, text_))
            text_ = text;
        return;
    }
    if (labels && labels->GetLabel(value.number, text_))
        return;
    std::string printed;
    kovar::ToString(value.number, format, printed);
    text_ = trimmed(printed);
}

std::string BpDataValue::Text() const {
    return text_;
}

BpComposite::BpComposite(std::string pattern, bool localise)
    : pattern_(std::move(pattern)), localise_(localise) {}

void BpComposite::Sublist() {
    sublists_.emplace_back();
    open_ = true;
}

void BpComposite::Add(std::unique_ptr<BpItem> item) {
    if (!item)
        return;
    if (!open_)
        sublists_.emplace_back();
    sublists_.back().push_back(std::move(item));
}

void BpComposite::EndSublist() {
    open_ = false;
}

std::vector<std::vector<std::string>> BpComposite::Texts() const {
    std::vector<std::vector<std::string>> texts;
    for (const auto& sublist : sublists_) {
        texts.emplace_back();
        for (const auto& item : sublist)
            texts.back().push_back(item->Text());
    }
    return texts;
}

BpHeading::BpHeading(std::string procedure, std::string pattern, std::vector<std::vector<std::string>> parts)
    : procedure_(std::move(procedure)), pattern_(std::move(pattern)), parts_(std::move(parts)) {}

std::string BpHeading::Text() const {
    std::string text;
    for (std::size_t i = 0; i < parts_.size(); ++i) {
        if (i > 0)
            text += ", ";
        for (std::size_t j = 0; j < parts_[i].size(); ++j) {
            if (j > 0)
                text += " = ";
            text += parts_[i][j];
        }
    }
    return text;
}

BpHeading BpProcedure::Heading(const BpComposite& composite) const {
    return BpHeading(name_, composite.Pattern(), composite.Texts());
}

} // namespace feed

#ifndef FEED_COREKIT_H
#define FEED_COREKIT_H

#include <feed/feed.h>

#include <memory>
#include <string>
#include <vector>

// The host's output headings: a composite of variables and data values, turned into a heading
// by the procedure that shows it.
namespace feed {

class BpItem {
public:
    virtual ~BpItem() = default;
    virtual std::string Text() const = 0;
};

// A variable as shown in output. Show mode 1: name; 2: label (the name without one); 3: both.
class BpVariable final : public BpItem {
public:
    BpVariable(const Kovar_Variable& variable, int showMode);
    std::string Text() const override;

private:
    std::string name_;
    std::string label_;
    int showMode_;
};

// A value of a variable. Preference 1: the printed value; 2: its value label when it has one.
class BpDataValue final : public BpItem {
public:
    BpDataValue(const Kovar_Variable& variable, const OBS& value, int preference);
    std::string Text() const override;

private:
    std::string text_;
};

class BpComposite {
public:
    BpComposite(std::string pattern, bool localise);

    void Sublist();
    // Null items are ignored; outside a sublist the item opens one of its own.
    void Add(std::unique_ptr<BpItem> item);
    void EndSublist();

    const std::string& Pattern() const { return pattern_; }
    bool Localise() const { return localise_; }
    // The texts of each sublist's items.
    std::vector<std::vector<std::string>> Texts() const;

private:
    std::string pattern_;
    bool localise_;
    bool open_ = false;
    std::vector<std::vector<std::unique_ptr<BpItem>>> sublists_;
};

class BpHeading {
public:
    BpHeading(std::string procedure, std::string pattern, std::vector<std::vector<std::string>> parts);

    const std::string& Procedure() const { return procedure_; }
    const std::string& Pattern() const { return pattern_; }
    const std::vector<std::vector<std::string>>& Parts() const { return parts_; }
    // The items of each sublist joined by " = ", sublists joined by ", ".
    std::string Text() const;

private:
    std::string procedure_;
    std::string pattern_;
    std::vector<std::vector<std::string>> parts_;
};

class BpProcedure {
public:
    explicit BpProcedure(std::string name) : name_(std::move(name)) {}
    const std::string& Name() const { return name_; }
    BpHeading Heading(const BpComposite& composite) const;

private:
    std::string name_;
};

} // namespace feed

#endif

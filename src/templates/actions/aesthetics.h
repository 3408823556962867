#ifndef PLOTAID_TEMPLATES_ACTIONS_AESTHETICS_H
#define PLOTAID_TEMPLATES_ACTIONS_AESTHETICS_H

// Element aesthetics: colour, dash, pattern, shape and size cycles, colours turned into dashes or
// images, attributes written straight onto the chart, and point markers over a lone line.
#include "templates/actions/Actions.h"

namespace plotaid::detail {

// Replaces the cycles of one aesthetic kind; setColor adds its affect and shared cycles.
class TSetColor final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

    enum class Affect { Unchanged, Main, Secondary, Both };

private:
    const CycleInstruction cycle_{instruction_};
    const Affect affect_ = readAffect();
    Affect readAffect() const;
};

class TSetDash final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const CycleInstruction cycle_{instruction_};
};

class TSetShape final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const CycleInstruction cycle_{instruction_};
};

class TSetPattern final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const CycleInstruction cycle_{instruction_};
};

class TSetSize final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const CycleInstruction cycle_{instruction_};
    // The "parameter" children: the size's length mappings, when there are any.
    const std::vector<const XERCES_CPP_NAMESPACE::DOMElement*> mappings_ =
        childrenNamed(instruction_, GrxUni::_parameter);
    const ElementKind kind_{instruction_};
};

// Colours become dashes or images.
class TAddDash final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const CycleInstruction cycle_{instruction_};
};

class TAddImage final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    const CycleInstruction cycle_{instruction_};
};

class TSetGenericAttributes final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;
};

class TSetShowLineMarkers final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;
};

} // namespace plotaid::detail

#endif

#ifndef PLOTAID_TEMPLATES_ACTIONS_ACTIONSHAPE_H
#define PLOTAID_TEMPLATES_ACTIONS_ACTIONSHAPE_H

// The shape every action shares: constructed with (source, target, instruction), applied once,
// destroyed. What it reads from its instruction lives in a private settings record that the
// action allocates and frees; the record points back at its action and owns no DOM node, so the
// template and the chart keep their own nodes. A family's source file defines `Name::Settings`.

#include <plotaid/BaseTemplate.h>

#include <memory>

#define PLOTAID_TEMPLATE_ACTION(Name)                                                                        \
    class Name final : public BaseTemplate {                                                                 \
    public:                                                                                                  \
        Name(const GrxVisualization* source, GrxVisualization& target,                                       \
             const XERCES_CPP_NAMESPACE::DOMElement* instruction);                                           \
        ~Name() override;                                                                                    \
        Name(const Name&) = delete;                                                                          \
        Name& operator=(const Name&) = delete;                                                               \
        bool apply() override;                                                                               \
        struct Settings;                                                                                     \
                                                                                                             \
    private:                                                                                                 \
        std::unique_ptr<Settings> settings_;                                                                 \
    };

// The constructor and destructor every such action has: the settings record is made with the
// action and pointed back at it. A family's source file says this once per class.
#define PLOTAID_TEMPLATE_ACTION_LIFETIME(Name)                                                               \
    Name::Name(const GrxVisualization* source, GrxVisualization& target,                                     \
               const XERCES_CPP_NAMESPACE::DOMElement* instruction)                                          \
        : BaseTemplate(source, target, instruction), settings_(std::make_unique<Settings>(*this)) {}         \
    Name::~Name() = default;

#endif

#ifndef PLOTAID_TEMPLATES_ACTIONS_ACTIONS_H
#define PLOTAID_TEMPLATES_ACTIONS_ACTIONS_H

// What an action family builds on. A family is one header declaring its action classes and one
// source defining them, with one `ActionFamily` at namespace scope that lists its rows:
//
//     const ActionFamily family{{u"setDash", "TSetDash", makeAction<TSetDash>}, ...};
//
// An action is a plain BaseTemplate: it reads its instruction while it is made (its members are
// initialised from `instruction_`) and `apply` carries it out.

#include "templates/InstructionWalk.h"
#include "templates/Kit.h"

#include <memory>
#include <type_traits>

namespace plotaid::detail {

template <class T, class = void> struct TakesFrameList : std::false_type {};
template <class T>
struct TakesFrameList<T, std::void_t<decltype(std::declval<T&>().setFrameList(std::declval<FrameList*>()))>>
    : std::true_type {};

// Makes the action of one instruction; an action that keeps frames across instructions
// ("addFrame") is handed the walk's frame list.
template <class T>
std::unique_ptr<BaseTemplate> makeAction(const GrxVisualization* source, GrxVisualization& target,
                                         const XERCES_CPP_NAMESPACE::DOMElement* instruction,
                                         FrameList& frames) {
    auto action = std::make_unique<T>(source, target, instruction);
    if constexpr (TakesFrameList<T>::value)
        action->setFrameList(&frames);
    return action;
}

} // namespace plotaid::detail

#endif

#ifndef PLOTAID_TEMPLATES_ACTIONS_ACTIONS_H
#define PLOTAID_TEMPLATES_ACTIONS_ACTIONS_H

// The action families, one source per family (style, frames, annotations, axes, datalabels,
// fitlines, aesthetics, categories, effects, interactivity, stylecycles). A family declares its
// classes in its own header here and includes it below; each class then takes its place in the
// walk's table (src/templates/ApplyTemplate.cpp) by replacing the null factory of its tag with
// makeAction<TClass>, one line per class.

#include "templates/InstructionWalk.h"
#include "templates/actions/aesthetics.h"
#include "templates/actions/style.h"

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

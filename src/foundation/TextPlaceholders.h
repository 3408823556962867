#ifndef PLOTAID_FOUNDATION_TEXTPLACEHOLDERS_H
#define PLOTAID_FOUNDATION_TEXTPLACEHOLDERS_H

#include <grx/ChartString.h>

#include <ctime>
#include <string>

namespace msgbook {
class FacSTDictionary;
}

namespace plotaid::detail {

// ChartBase::updateText at a given moment, so that the filling can be checked at fixed times.
void updateTextAt(ChartString& text, const msgbook::FacSTDictionary* dictionary, const std::string& encoding,
                  const std::tm& now);

} // namespace plotaid::detail

#endif

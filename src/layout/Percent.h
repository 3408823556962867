#ifndef PLOTAID_LAYOUT_PERCENT_H
#define PLOTAID_LAYOUT_PERCENT_H

#include <grx/ChartString.h>

namespace plotaid::detail {

// The per-cent text of a location: one decimal kept, toward zero, then "%". Values beyond the
// range of an int are clamped to it.
ChartString percentText(double percent);

} // namespace plotaid::detail

#endif

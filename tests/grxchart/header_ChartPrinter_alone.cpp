// Compiles only if <grx/ChartPrinter.h> brings everything it needs.
#include <grx/ChartPrinter.h>

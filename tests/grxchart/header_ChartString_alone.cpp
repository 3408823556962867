// Compiles only if <grx/ChartString.h> brings everything it needs.
#include <grx/ChartString.h>

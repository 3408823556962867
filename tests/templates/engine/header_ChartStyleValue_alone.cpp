// Compiles only if <plotaid/ChartStyleValue.h> brings everything it needs.
#include <plotaid/ChartStyleValue.h>

// Compiles only if <plotaid/ChartTemplate.h> brings everything it needs.
#include <plotaid/ChartTemplate.h>

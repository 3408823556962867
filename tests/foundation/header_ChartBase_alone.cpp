// Compiles only if <plotaid/ChartBase.h> brings everything it needs.
#include <plotaid/ChartBase.h>

// Compiles only if <plotaid/ChartTransformer.h> brings everything it needs.
#include <plotaid/ChartTransformer.h>

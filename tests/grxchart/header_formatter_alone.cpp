// Compiles only if <grx/formatter.h> brings everything it needs.
#include <grx/formatter.h>

// Compiles only if <grx/grx.h> brings everything it needs.
#include <grx/grx.h>

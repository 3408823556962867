// Compiles only if <grx/GrxStyle.h> brings everything it needs.
#include <grx/GrxStyle.h>

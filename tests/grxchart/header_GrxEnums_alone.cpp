// Compiles only if <grx/GrxEnums.h> brings everything it needs.
#include <grx/GrxEnums.h>

// Compiles only if <grx/GrxModel.h> brings everything it needs.
#include <grx/GrxModel.h>

// Compiles only if <grx/GrxUni.h> brings everything it needs.
#include <grx/GrxUni.h>

// Compiles only if <grx/GrxDocument.h> brings everything it needs.
#include <grx/GrxDocument.h>

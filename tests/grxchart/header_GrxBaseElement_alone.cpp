// Compiles only if <grx/GrxBaseElement.h> brings everything it needs.
#include <grx/GrxBaseElement.h>

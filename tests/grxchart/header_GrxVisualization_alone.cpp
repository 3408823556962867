// Compiles only if <grx/GrxVisualization.h> brings everything it needs.
#include <grx/GrxVisualization.h>

// Compiles only if <plotaid/TreeEntityResolver.h> brings everything it needs.
#include <plotaid/TreeEntityResolver.h>

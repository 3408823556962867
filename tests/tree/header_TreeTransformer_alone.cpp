// Compiles only if <plotaid/TreeTransformer.h> brings everything it needs.
#include <plotaid/TreeTransformer.h>

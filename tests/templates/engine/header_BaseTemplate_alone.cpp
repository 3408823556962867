// Compiles only if <plotaid/BaseTemplate.h> brings everything it needs.
#include <plotaid/BaseTemplate.h>

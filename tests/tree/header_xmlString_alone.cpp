// Compiles only if <plotaid/xmlString.h> brings everything it needs.
#include <plotaid/xmlString.h>

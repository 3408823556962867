#ifndef GRX_GRXSTYLE_H
#define GRX_GRXSTYLE_H

// The object model's classes are declared together (they refer to one another).
#include <grx/GrxModel.h>

#endif

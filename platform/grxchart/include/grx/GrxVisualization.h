#ifndef GRX_GRXVISUALIZATION_H
#define GRX_GRXVISUALIZATION_H

// The object model's classes are declared together (they refer to one another).
#include <grx/GrxModel.h>

#endif

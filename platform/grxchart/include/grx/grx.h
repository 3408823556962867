#ifndef GRX_GRX_H
#define GRX_GRX_H

// Everything of the chart object model.
#include <grx/ChartPrinter.h>
#include <grx/ChartString.h>
#include <grx/GrxModel.h>
#include <grx/GrxUni.h>
#include <grx/formatter.h>

#endif

#ifndef PLOTAID_PLOTAID_H
#define PLOTAID_PLOTAID_H

// Everything a host needs: one header per exported class.
#include <plotaid/BaseTemplate.h>
#include <plotaid/ChartAxis.h>
#include <plotaid/ChartBase.h>
#include <plotaid/ChartDimension.h>
#include <plotaid/ChartElement.h>
#include <plotaid/ChartElementElement.h>
#include <plotaid/ChartErrorHandler.h>
#include <plotaid/ChartException.h>
#include <plotaid/ChartFacetLabel.h>
#include <plotaid/ChartFacetLabeling.h>
#include <plotaid/ChartFrame.h>
#include <plotaid/ChartGraph.h>
#include <plotaid/ChartGuide.h>
#include <plotaid/ChartKey.h>
#include <plotaid/ChartParameter.h>
#include <plotaid/ChartStyleValue.h>
#include <plotaid/ChartTemplate.h>
#include <plotaid/ChartTransformer.h>
#include <plotaid/ChartTranscoder.h>
#include <plotaid/ChartVariable.h>
#include <plotaid/FramePacker.h>
#include <plotaid/Kovar_Format.h>
#include <plotaid/splitInfo.h>
#include <plotaid/TimeConverter.h>
#include <plotaid/TimeStamp.h>
#include <plotaid/TreeEntityResolver.h>
#include <plotaid/TreeTransformer.h>
#include <plotaid/VarDataProcessor.h>
#include <plotaid/XmlDataHandler.h>
#include <plotaid/xmlString.h>

#endif

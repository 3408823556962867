#ifndef GRX_GRXENUMS_H
#define GRX_GRXENUMS_H

// Each enumeration's numbers (the API) and words (the XML), one table per enumeration. Numbers
// without a word here are written as decimals.

#include <grx/GrxBaseElement.h>

namespace grx {

inline constexpr EnumWord kTickPosition[] = {{0, u"inside"}, {1, u"outside"}, {2, u"cross"}};
inline constexpr EnumWord kDeltaUnit[] = {{0, u"second"}, {1, u"minute"}, {2, u"hour"}, {3, u"day"},
                                          {4, u"week"},   {5, u"month"},  {6, u"year"}};
inline constexpr EnumWord kLocationPart[] = {{0, u"left"},   {1, u"right"}, {2, u"top"},
                                             {3, u"bottom"}, {4, u"width"}, {5, u"height"}};
inline constexpr EnumWord kLocationMethod[] = {
    {0, u"fixed"}, {1, u"content"}, {2, u"sameEdge"}, {3, u"nextTo"}};
inline constexpr EnumWord kAxisTransform[] = {{0, u"derived"}, {1, u"percent"}, {2, u"none"}};
inline constexpr EnumWord kBreakRepresentation[] = {
    {0, u"none"}, {1, u"gap"}, {2, u"interpolated"}, {3, u"wings"}};
inline constexpr EnumWord kGridType[] = {{0, u"hex"}, {1, u"dot"}, {2, u"square"}};
inline constexpr EnumWord kBinLocation[] = {{0, u"grid"}, {1, u"centroid"}};
inline constexpr EnumWord kBinMethod[] = {{0, u"other"}, {1, u"allDimensions"}, {2, u"notResponse"}};
inline constexpr EnumWord kKernel[] = {{0, u"uniform"},   {1, u"epanechnikov"}, {2, u"biweight"},
                                       {3, u"triweight"}, {4, u"tricube"},      {5, u"gaussian"},
                                       {6, u"cauchy"}};
inline constexpr EnumWord kDistribution[] = {
    {1, u"uniform"},  {2, u"normal"},  {3, u"t"},           {4, u"f"},        {5, u"chisquare"},
    {6, u"gamma"},    {7, u"beta"},    {8, u"exponential"}, {9, u"logistic"}, {10, u"studentizedrange"},
    {11, u"weibull"}, {12, u"poisson"}};
inline constexpr EnumWord kScaleMethod[] = {
    {1, u"linear"}, {2, u"log"}, {3, u"power"}, {4, u"log_safe"}, {5, u"power_safe"}, {6, u"logit"},
    {7, u"probit"}, {8, u"asn"}, {9, u"atanh"}, {10, u"prob"},    {11, u"cLoglog"}};
inline constexpr EnumWord kAffect[] = {{0, u"none"}, {1, u"both"}, {2, u"main"}, {3, u"secondary"}};
inline constexpr EnumWord kLinkReference[] = {
    {0, u"none"}, {1, u"centroid"}, {2, u"base"}, {3, u"origin"}, {4, u"mean"}};
inline constexpr EnumWord kFontWeight[] = {{1, u"regular"}, {2, u"bold"}};

} // namespace grx

#endif

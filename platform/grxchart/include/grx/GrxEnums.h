#ifndef GRX_GRXENUMS_H
#define GRX_GRXENUMS_H

// Each enumeration's named values (the API) and words (the XML). A word table pairs each name with
// the word spelt like it, so the two cannot drift apart; numbers without a word are written as
// decimals. The integer API stays: a named value converts to int where a setter takes one.

#include <grx/GrxBaseElement.h>

namespace grx {

#define GRX_WORD(Enum, name) {Enum::name, u## #name}

struct TickPosition {
    enum : int { inside = 0, outside = 1, cross = 2 };
};
inline constexpr EnumWord kTickPosition[] = {GRX_WORD(TickPosition, inside), GRX_WORD(TickPosition, outside),
                                             GRX_WORD(TickPosition, cross)};

struct DeltaUnit {
    enum : int { second = 0, minute = 1, hour = 2, day = 3, week = 4, month = 5, year = 6 };
};
inline constexpr EnumWord kDeltaUnit[] = {GRX_WORD(DeltaUnit, second), GRX_WORD(DeltaUnit, minute),
                                          GRX_WORD(DeltaUnit, hour),   GRX_WORD(DeltaUnit, day),
                                          GRX_WORD(DeltaUnit, week),   GRX_WORD(DeltaUnit, month),
                                          GRX_WORD(DeltaUnit, year)};

struct LocationPart {
    enum : int { left = 0, right = 1, top = 2, bottom = 3, width = 4, height = 5 };
};
inline constexpr EnumWord kLocationPart[] = {GRX_WORD(LocationPart, left),   GRX_WORD(LocationPart, right),
                                             GRX_WORD(LocationPart, top),    GRX_WORD(LocationPart, bottom),
                                             GRX_WORD(LocationPart, width),  GRX_WORD(LocationPart, height)};

// fixed: a percentage; content: sized to content; sameEdge: the target frame's edge; nextTo: against
// the target frame.
struct LocationMethod {
    enum : int { fixed = 0, content = 1, sameEdge = 2, nextTo = 3 };
};
inline constexpr EnumWord kLocationMethod[] = {GRX_WORD(LocationMethod, fixed), GRX_WORD(LocationMethod, content),
                                               GRX_WORD(LocationMethod, sameEdge),
                                               GRX_WORD(LocationMethod, nextTo)};

// none (also when absent) is a plain axis; derived has transform parameters.
struct AxisTransform {
    enum : int { derived = 0, percent = 1, none = 2 };
};
inline constexpr EnumWord kAxisTransform[] = {GRX_WORD(AxisTransform, derived), GRX_WORD(AxisTransform, percent),
                                              GRX_WORD(AxisTransform, none)};

struct BreakRepresentation {
    enum : int { none = 0, gap = 1, interpolated = 2, wings = 3 };
};
inline constexpr EnumWord kBreakRepresentation[] = {
    GRX_WORD(BreakRepresentation, none), GRX_WORD(BreakRepresentation, gap),
    GRX_WORD(BreakRepresentation, interpolated), GRX_WORD(BreakRepresentation, wings)};

struct GridType {
    enum : int { hex = 0, dot = 1, square = 2 };
};
inline constexpr EnumWord kGridType[] = {GRX_WORD(GridType, hex), GRX_WORD(GridType, dot),
                                         GRX_WORD(GridType, square)};

struct BinLocation {
    enum : int { grid = 0, centroid = 1 };
};
inline constexpr EnumWord kBinLocation[] = {GRX_WORD(BinLocation, grid), GRX_WORD(BinLocation, centroid)};

struct BinMethod {
    enum : int { other = 0, allDimensions = 1, notResponse = 2 };
};
inline constexpr EnumWord kBinMethod[] = {GRX_WORD(BinMethod, other), GRX_WORD(BinMethod, allDimensions),
                                          GRX_WORD(BinMethod, notResponse)};

struct Kernel {
    enum : int { uniform = 0, epanechnikov = 1, biweight = 2, triweight = 3, tricube = 4, gaussian = 5, cauchy = 6 };
};
inline constexpr EnumWord kKernel[] = {GRX_WORD(Kernel, uniform),  GRX_WORD(Kernel, epanechnikov),
                                       GRX_WORD(Kernel, biweight), GRX_WORD(Kernel, triweight),
                                       GRX_WORD(Kernel, tricube),  GRX_WORD(Kernel, gaussian),
                                       GRX_WORD(Kernel, cauchy)};

struct Distribution {
    enum : int {
        uniform = 1,
        normal = 2,
        t = 3,
        f = 4,
        chisquare = 5,
        gamma = 6,
        beta = 7,
        exponential = 8,
        logistic = 9,
        studentizedrange = 10,
        weibull = 11,
        poisson = 12
    };
};
inline constexpr EnumWord kDistribution[] = {
    GRX_WORD(Distribution, uniform),     GRX_WORD(Distribution, normal),
    GRX_WORD(Distribution, t),           GRX_WORD(Distribution, f),
    GRX_WORD(Distribution, chisquare),   GRX_WORD(Distribution, gamma),
    GRX_WORD(Distribution, beta),        GRX_WORD(Distribution, exponential),
    GRX_WORD(Distribution, logistic),    GRX_WORD(Distribution, studentizedrange),
    GRX_WORD(Distribution, weibull),     GRX_WORD(Distribution, poisson)};

// linear is also what any unreadable method reads as.
struct ScaleMethod {
    enum : int {
        linear = 1,
        log = 2,
        power = 3,
        log_safe = 4,
        power_safe = 5,
        logit = 6,
        probit = 7,
        asn = 8,
        atanh = 9,
        prob = 10,
        cLoglog = 11
    };
};
inline constexpr EnumWord kScaleMethod[] = {
    GRX_WORD(ScaleMethod, linear), GRX_WORD(ScaleMethod, log),        GRX_WORD(ScaleMethod, power),
    GRX_WORD(ScaleMethod, log_safe), GRX_WORD(ScaleMethod, power_safe), GRX_WORD(ScaleMethod, logit),
    GRX_WORD(ScaleMethod, probit), GRX_WORD(ScaleMethod, asn),        GRX_WORD(ScaleMethod, atanh),
    GRX_WORD(ScaleMethod, prob),   GRX_WORD(ScaleMethod, cLoglog)};

// Which colours of an element a colour aesthetic sets.
struct Affect {
    enum : int { none = 0, both = 1, main = 2, secondary = 3 };
};
inline constexpr EnumWord kAffect[] = {GRX_WORD(Affect, none), GRX_WORD(Affect, both), GRX_WORD(Affect, main),
                                       GRX_WORD(Affect, secondary)};

struct LinkReference {
    enum : int { none = 0, centroid = 1, base = 2, origin = 3, mean = 4 };
};
inline constexpr EnumWord kLinkReference[] = {GRX_WORD(LinkReference, none), GRX_WORD(LinkReference, centroid),
                                              GRX_WORD(LinkReference, base), GRX_WORD(LinkReference, origin),
                                              GRX_WORD(LinkReference, mean)};

struct FontWeight {
    enum : int { regular = 1, bold = 2 };
};
inline constexpr EnumWord kFontWeight[] = {GRX_WORD(FontWeight, regular), GRX_WORD(FontWeight, bold)};

#undef GRX_WORD

// Enumerations written as numbers: only the values the library tests for are named.
struct SummaryMethod {
    enum : int {
        none = 0,
        count = 1,
        percent = 3,
        binPercent = 4, // share of cases per bin, as histograms show it
        range = 7,
        histogram = 10,
        rangeLow = 18,
        rangeHigh = 19
    };
};
// How an element sits beside its neighbours: stacked, or moved aside (bars beside a cluster).
struct PositionModifier {
    enum : int { none = 0, spikes = 1, stack = 3, stackPercent = 4, dodge = 7 };
};
struct SmoothMethod {
    enum : int { linear = 0, loess = 1, polynomial = 6, spline = 12, stepLeft = 13, stepRight = 14, step = 15 };
};
struct SimpleSortMethod {
    enum : int { data = 0, fixedOrder = 1, natural = 2, other = 3 };
};
struct FacetLayoutMethod {
    enum : int { unwrapped = 1, wrapped = 2 };
};
struct PlaneNormal {
    enum : int { x = 0, y = 1, z = 2 };
};

} // namespace grx

#endif

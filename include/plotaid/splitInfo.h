#ifndef PLOTAID_SPLITINFO_H
#define PLOTAID_SPLITINFO_H

#include <plotaid/Export.h>

#include <string>

namespace feed {
class BpHeading;
class BpProcedure;
class ProcDSIterator;
class ProcedureDataSource;
} // namespace feed

// The split-file values of the current split group: a label for chart titles and a heading for
// the output outline.
class PLOTAID_API splitInfo {
public:
    splitInfo();
    virtual ~splitInfo();
    splitInfo(const splitInfo&) = delete;
    splitInfo& operator=(const splitInfo&) = delete;

    // Records the split variables and their values in the current case, replacing those of an
    // earlier call. A null source keeps the earlier values but leaves no heading to build.
    // A split variable that cannot be read is left out. Always true.
    bool saveSplitInfo(feed::ProcDSIterator* cases, const feed::ProcedureDataSource* source);

    // "name = value, name = value", with labels instead of names unless useNames.
    std::string getSplitLabel(bool useNames) const;

    // A new heading that the caller owns, or null before saveSplitInfo or when the procedure's
    // output takes no split heading.
    feed::BpHeading* activateSplit(feed::BpProcedure& procedure) const;

private:
    struct Impl;
    Impl* impl_;
};

#endif

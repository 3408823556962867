#ifndef PLOTAID_FRAMEPACKER_H
#define PLOTAID_FRAMEPACKER_H

#include <plotaid/Export.h>

#include <grx/ChartString.h>

#include <vector>

class GrrUviza;
class GrxContainer;
class GrxDocument;
class GrxVisualization;

// Lays out the frames of a chart in one fixed pattern: titles stacked from the top, footnotes
// from the bottom, the graph between them, legends, statistics summaries and keys in a column on
// the right. Frames whose places the user set are left where they are.
class PLOTAID_API FramePacker {
public:
    FramePacker() = default;
    virtual ~FramePacker();
    FramePacker& operator=(const FramePacker&) = default;

    // Replaces the locations of `vis`'s frames; always true. A frame whose element in `reference`
    // is placed only by fixed values stays as it is; without a reference every frame moves.
    bool packFrames(GrxVisualization& vis, GrxDocument* reference) const;

private:
    FramePacker(const FramePacker&) = default;
    // The graphs of each container, then of its child containers, depth first.
    void getGraphChildren(const std::vector<GrxContainer*>& containers, std::vector<GrrUviza*>& graphs) const;
    ChartString assignValue(double percent) const;
};

#endif

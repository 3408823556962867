#ifndef PLOTAID_TEMPLATES_ACTIONS_FRAMES_H
#define PLOTAID_TEMPLATES_ACTIONS_FRAMES_H

// Frame actions: placing and styling the frames of a chart (titles, footnotes, legends, graphs,
// free texts, containers), hiding them, and the statistics box of a histogram. The special frames
// are the ones the visualization's extension names.
#include "templates/actions/Actions.h"

namespace plotaid::detail {

class TAddFrame final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;
    // The walk's list of frames placed by earlier instructions; kept, not read.
    void setFrameList(FrameList* frames) { frames_ = frames; }

private:
    FrameList* frames_ = nullptr;
};

class THideFrame final : public BaseTemplate, public ResultCarriesNothing {
public:
    THideFrame(const GrxVisualization* source, GrxVisualization& target, const DOMElement* instruction);
    // Always false: hiding is never reported as a change.
    bool apply() override;

private:
    std::uint32_t count_;
    int kind_;
};

class TAddHistogramSummaryFrame final : public BaseTemplate {
public:
    using BaseTemplate::BaseTemplate;
    bool apply() override;

private:
    void loadLabels();
    ChartString mean_, stdDev_, n_, days_;
    bool loaded_ = false;
    std::size_t total_ = 0;
};

// A dictionary word as a summary label: each backslash-n pair a line feed, one blank appended.
ChartString summaryLabel(ChartString word);

} // namespace plotaid::detail

#endif

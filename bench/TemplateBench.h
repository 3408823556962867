#ifndef PLOTAID_BENCH_TEMPLATEBENCH_H
#define PLOTAID_BENCH_TEMPLATEBENCH_H

// A template application as a host makes one, and its floor: the same validated parses and one
// serialisation without the walk. Each skips the benchmark with a reason when an input is refused.

#include "foundation/ValidatingParser.h"

#include <plotaid/ChartException.h>
#include <plotaid/ChartTemplate.h>

#include <grx/grx.h>

#include <benchmark/benchmark.h>

#include <xercesc/dom/DOM.hpp>

#include <string>

namespace bench {

inline void applyTemplateLoop(benchmark::State& state, const std::string& chart, const std::string& text) {
    const ChartException refused("bench input", "bench/template", 0);
    plotaid::detail::ValidatingParser parser;
    for (auto _ : state) {
        if (!parser.parse(chart, "bench", refused, plotaid::detail::DocumentKind::Chart)) {
            state.SkipWithError("the chart does not validate");
            return;
        }
        plotaid::detail::OwnedDocument doc = parser.adoptDocument();
        GrxVisualization vis(doc.release()->getDocumentElement(), true);
        ChartTemplate chartTemplate(vis, nullptr);
        if (!chartTemplate.setTemplate(text)) {
            state.SkipWithError("the template does not validate");
            return;
        }
        chartTemplate.applyTemplate();
        benchmark::DoNotOptimize(vis.AsUTF8());
    }
}

inline void applyTemplateFloorLoop(benchmark::State& state, const std::string& chart, const std::string& text) {
    const ChartException refused("bench input", "bench/template", 0);
    plotaid::detail::ValidatingParser chartParser, templateParser;
    for (auto _ : state) {
        if (!chartParser.parse(chart, "bench", refused, plotaid::detail::DocumentKind::Chart) ||
            !templateParser.parse(text, "bench", refused, plotaid::detail::DocumentKind::Template)) {
            state.SkipWithError("the inputs do not validate");
            return;
        }
        plotaid::detail::OwnedDocument doc = chartParser.adoptDocument();
        GrxVisualization vis(doc.release()->getDocumentElement(), true);
        benchmark::DoNotOptimize(vis.AsUTF8());
    }
}

} // namespace bench

#endif

# Templates a chart designer writes: a corporate look on a clustered bar chart, a monochrome print
# look on a chart of several series lines, a presentation look on a box plot. Each instruction is
# reported; the restyled charts still validate.
step apply --chart "$here"/examples/charts/clustered-bar.xml --template "$here"/examples/templates/corporate.sgt \
  -o "$out/clustered-bar-corporate.xml" --report
step apply --chart "$here"/examples/charts/line-series.xml --template "$here"/examples/templates/monochrome.sgt \
  -o "$out/line-series-monochrome.xml" --report
step apply --chart "$here"/examples/charts/boxplot.xml --template "$here"/examples/templates/presentation.sgt \
  -o "$out/boxplot-presentation.xml" --report
step validate "$out/clustered-bar-corporate.xml" "$out/line-series-monochrome.xml" "$out/boxplot-presentation.xml"

# Applying a template to a chart: each instruction is reported, "unsupported" until its action is built.
step apply --chart "$here"/examples/charts/simple-bar.xml --template "$here"/examples/templates/bar-tidy.sgt \
  -o "$out/simple-bar-tidy.xml" --report
step validate "$out/simple-bar-tidy.xml"
# The main job: a chart apart from its data. Split the sample into the chart (its data replaced by a
# reference) and its data; apply the template to the compressed chart with the bundled data stream and
# write the whole document, data back in place.
step chart split "$here"/examples/charts/simple-bar.xml -o "$out/simple-bar.chart.xml" --compressed
step apply --chart "$out/simple-bar.chart.xml" --data "$here"/examples/data/simple-bar.stream \
  --template "$here"/examples/templates/bar-tidy.sgt --entire --report -o "$out/simple-bar-whole.xml"
step validate "$out/simple-bar-whole.xml"
grep -c "<row>" "$out/simple-bar-whole.xml" | sed 's/^/data rows back in the whole document: /'
# The reverse: merge the plain chart and its XML data document.
step chart split "$here"/examples/charts/area.xml -o "$out/area.chart.xml"
step chart merge "$out/area.chart.xml" "$out/area.data.xml" -o "$out/area-whole.xml"
step validate "$out/area-whole.xml"

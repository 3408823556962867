# Checking documents against their grammars: the sample charts pass, a damaged chart is refused
# with one line per fault.
step validate "$here"/examples/charts/simple-bar.xml "$here"/examples/charts/histogram.xml \
  "$here"/examples/charts/population-pyramid.xml
sed 's/<graph /<chart\/><graph /' "$here/examples/charts/simple-bar.xml" > "$out/damaged.xml"
step validate "$out/damaged.xml" || echo "(refused, as it should be)"

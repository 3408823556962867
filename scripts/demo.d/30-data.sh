# Chart data: the embedded data of a sample chart as a binary data stream, its XML data document,
# and a look at both. The stream and the XML hold the same values.
step data to-stream "$here/examples/charts/simple-bar.xml" -o "$out/simple-bar.stream"
step data show "$out/simple-bar.stream" --rows 5
step data to-xml "$out/simple-bar.stream" --compressed -o "$out/simple-bar.xml.z"
step data show "$out/simple-bar.xml.z" --rows 3
step data to-xml "$here/examples/data/line-series.stream" -o "$out/line-series.xml"
if cmp -s "$out/line-series.xml" "$here/examples/data/line-series.xml"; then
  echo "the stream converts to the bundled XML data byte for byte"
else
  echo "the stream's XML differs from the bundled XML data" >&2
  exit 1
fi
# A damaged stream is refused, not half-read.
head -c 100 "$out/simple-bar.stream" > "$out/cut.stream"
step data show "$out/cut.stream" 2>&1 || echo "(refused, as it should be)"

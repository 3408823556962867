# Compressing a chart document the way the library stores it, and getting it back byte for byte.
chart="$here/examples/charts/line-series.xml"
step compress "$chart" -o "$out/line-series.z"
step decompress "$out/line-series.z" -o "$out/line-series.xml"
if cmp -s "$chart" "$out/line-series.xml"; then
  echo "the decompressed chart is identical to the original"
else
  echo "the decompressed chart differs from the original" >&2
  exit 1
fi
# A damaged stream is refused, not half-read.
head -c 200 "$out/line-series.z" > "$out/cut.z"
step decompress "$out/cut.z" -o "$out/cut.xml" 2>&1 || echo "(refused, as it should be)"

# Drawing a chart before and after a designer template, side by side.
if "$tool" render --help >/dev/null 2>&1; then
  step render "$here/examples/charts/clustered-bar.xml" --template "$here/examples/templates/corporate.sgt" \
    --before-after -o "$out/clustered-bar.png" --size 640x480
  echo "wrote a $(wc -c < "$out/clustered-bar.png")-byte PNG"
fi

# Applying a template to a chart: each instruction is reported, "unsupported" until its action is built.
step apply --chart "$here"/examples/charts/simple-bar.xml --template "$here"/examples/templates/bar-tidy.sgt \
  -o "$out/simple-bar-tidy.xml" --report
step validate "$out/simple-bar-tidy.xml"

# A decision tree for the tree viewer: display settings with a few options, and the model as a PMML
# document (checked against the PMML 2.1 grammar before it is written) and compressed. The
# compressed model reads back to the same document.
step tree --pmml "$here/examples/pmml/credit-risk.xml" --orientation left-to-right --zoom 150 \
  --contents both --colors chart '#FF1F77B4,#FFFF7F0E' --language en-GB \
  --pmml-out "$out/credit-risk.xml" --compressed-pmml-out "$out/credit-risk.z"
step tree --pmml "$out/credit-risk.z" --pmml-out "$out/credit-risk-again.xml" > /dev/null
if cmp -s "$out/credit-risk.xml" "$out/credit-risk-again.xml"; then
  echo "the compressed model gives the same PMML document"
else
  echo "the compressed model gives a different PMML document" >&2
  exit 1
fi
# A zoom outside 2 to 500 is a mistake on the command line.
step tree --pmml "$here/examples/pmml/house-prices.xml" --zoom 1000 2>&1 || echo "(refused, as it should be)"

// The grammar suite's helpers (xmllint with the source tree's catalog, scratch files), built into
// this program too so both suites check charts the same way.
#include "grammar/GrammarSupport.cpp"

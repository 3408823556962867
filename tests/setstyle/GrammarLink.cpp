// The grammar suite's validators (xmllint with the source tree's schemas), linked in here as well.
#include "grammar/GrammarSupport.cpp"

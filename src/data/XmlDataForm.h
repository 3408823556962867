#ifndef PLOTAID_DATA_XMLDATAFORM_H
#define PLOTAID_DATA_XMLDATAFORM_H

#include <plotaid/VarDataProcessor.h>

#include <string>
#include <string_view>

// The XML data form on its own, between a store and text (the handler adds streams and zlib).
namespace plotaid::detail {

// Appends the whole XML data document of the store to out.
void writeXmlData(VarDataProcessor& store, std::string& out);

// Reads every data source of the text (current form, or the 1.4 form when the text names its
// grammar) into the store; false when the text claims more memory than its length justifies.
bool readXmlData(VarDataProcessor& store, std::string_view xml);

} // namespace plotaid::detail

#endif

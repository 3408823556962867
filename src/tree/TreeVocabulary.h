#ifndef PLOTAID_TREE_TREEVOCABULARY_H
#define PLOTAID_TREE_TREEVOCABULARY_H

#include <xercesc/util/XercesDefs.hpp>

namespace plotaid::detail {

// Namespaces and grammar locations of the tree viewer's documents.
inline constexpr XMLCh kTreeViewNamespace[] = u"http://plotaid.org/treeview/1.0";
inline constexpr XMLCh kTreeViewSchemaFile[] = u"treeview-1.0.xsd";
inline constexpr XMLCh kTreeViewSchemaUri[] = u"http://plotaid.org/treeview/1.0/treeview-1.0.xsd";
inline constexpr XMLCh kTreeViewSchemaLocation[] =
    u"http://plotaid.org/treeview/1.0 http://plotaid.org/treeview/1.0/treeview-1.0.xsd";

inline constexpr XMLCh kPmmlNamespace[] = u"http://www.dmg.org/PMML-2_1";
inline constexpr XMLCh kPmmlSchemaFile[] = u"pmml-2-1.xsd";
inline constexpr XMLCh kPmmlSchemaUri[] = u"http://www.dmg.org/PMML-2_1/pmml-2-1.xsd";
inline constexpr XMLCh kPmmlSchemaLocation[] =
    u"http://www.dmg.org/PMML-2_1 http://www.dmg.org/PMML-2_1/pmml-2-1.xsd";

inline constexpr XMLCh kXmlnsNamespace[] = u"http://www.w3.org/2000/xmlns/";
inline constexpr XMLCh kSchemaInstanceNamespace[] = u"http://www.w3.org/2001/XMLSchema-instance";

} // namespace plotaid::detail

#endif

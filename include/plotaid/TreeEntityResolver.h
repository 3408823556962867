#ifndef PLOTAID_TREEENTITYRESOLVER_H
#define PLOTAID_TREEENTITYRESOLVER_H

#include <plotaid/Export.h>

#include <xercesc/sax/EntityResolver.hpp>

// Resolves the two grammars of the tree viewer, the PMML grammar (any system id ending in
// "pmml-2-1.xsd") and the display-settings grammar (ending in "treeview-1.0.xsd"), to the files of
// that name in the resource folder's schemas/ folder. Every other system id is refused: logged, and
// null returned, so no file outside the resource folder is ever read.
class PLOTAID_API TreeEntityResolver : public XERCES_CPP_NAMESPACE::EntityResolver {
public:
    ~TreeEntityResolver() override;
    // The input source belongs to the caller (the parser).
    XERCES_CPP_NAMESPACE::InputSource* resolveEntity(const XMLCh* const publicId,
                                                     const XMLCh* const systemId) override;
};

#endif

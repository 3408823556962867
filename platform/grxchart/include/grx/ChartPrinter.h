#ifndef GRX_CHARTPRINTER_H
#define GRX_CHARTPRINTER_H

#include <grx/ChartString.h>
#include <grx/Export.h>

#include <xercesc/dom/DOMDocument.hpp>
#include <xercesc/dom/DOMNode.hpp>

#include <ostream>

// Writes DOM documents and nodes as XML text, in UTF-8 unless another encoding is set here
// (whatever the document declares). Faults of the serialiser surface as DOMLSException.
class GRX_API ChartPrinter {
public:
    void setPrintWhiteSpace(bool on) { whiteSpace_ = on; }
    bool getPrintWhiteSpace() const { return whiteSpace_; }
    // An empty or null name goes back to UTF-8.
    void setEncoding(const XMLCh* encoding) { encoding_ = ChartString(encoding); }

    void Print(const xercesc::DOMDocument* document, std::ostream& out) const;
    void Print(const xercesc::DOMNode* node, std::ostream& out) const;

private:
    bool whiteSpace_ = false;
    ChartString encoding_;
};

#endif

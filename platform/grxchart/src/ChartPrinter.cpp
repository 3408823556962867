#include <grx/ChartPrinter.h>

#include <xercesc/dom/DOMImplementation.hpp>
#include <xercesc/dom/DOMImplementationRegistry.hpp>
#include <xercesc/dom/DOMLSOutput.hpp>
#include <xercesc/dom/DOMLSSerializer.hpp>
#include <xercesc/framework/XMLFormatter.hpp>
#include <xercesc/util/XMLUni.hpp>

#include <memory>

using namespace xercesc;

namespace {

class StreamTarget : public XMLFormatTarget {
public:
    explicit StreamTarget(std::ostream& out) : out_(out) {}
    void writeChars(const XMLByte* const bytes, const XMLSize_t count, XMLFormatter* const) override {
        out_.write(reinterpret_cast<const char*>(bytes), static_cast<std::streamsize>(count));
    }
    void flush() override { out_.flush(); }

private:
    std::ostream& out_;
};

struct Release {
    template <class T> void operator()(T* p) const { p->release(); }
};

} // namespace

void ChartPrinter::Print(const DOMDocument* document, std::ostream& out) const {
    Print(static_cast<const DOMNode*>(document), out);
}

void ChartPrinter::Print(const DOMNode* node, std::ostream& out) const {
    if (!node)
        return;
    static const XMLCh ls[] = u"LS";
    DOMImplementation* impl = DOMImplementationRegistry::getDOMImplementation(ls);
    std::unique_ptr<DOMLSSerializer, Release> writer(impl->createLSSerializer());
    std::unique_ptr<DOMLSOutput, Release> output(impl->createLSOutput());
    DOMConfiguration* config = writer->getDomConfig();
    if (config->canSetParameter(XMLUni::fgDOMWRTFormatPrettyPrint, whiteSpace_))
        config->setParameter(XMLUni::fgDOMWRTFormatPrettyPrint, whiteSpace_);

    output->setEncoding(encoding_.empty() ? XMLUni::fgUTF8EncodingString : encoding_.xc_str());

    StreamTarget target(out);
    output->setByteStream(&target);
    writer->write(node, output.get());
}

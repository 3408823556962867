#ifndef PLOTAID_CHARTTRANSFORMER_H
#define PLOTAID_CHARTTRANSFORMER_H

#include <plotaid/ChartBase.h>
#include <plotaid/Export.h>

#include <xercesc/util/XercesDefs.hpp>

#include <memory>
#include <string>
#include <vector>

XERCES_CPP_NAMESPACE_BEGIN
class DOMDocument;
class DOMElement;
XERCES_CPP_NAMESPACE_END

class GrxVisualization;

// The host's handle on one chart with its data. The chart is held as a visualization whose data
// sources are references (user sources); the sources themselves are kept apart, either as a
// compressed data document or as the caller's binary data stream, and merged back on request.
// No operation throws; a transformer whose chart could not be built answers with empty texts,
// false and 0. Not copyable: it owns its visualization.
class PLOTAID_API ChartTransformer : public ChartBase {
public:
    // Plain chart text: its data sources move into the held data document.
    explicit ChartTransformer(const std::string& xml);
    // Compressed chart text and a compressed data document (held as given).
    ChartTransformer(const std::string& compressedXml, const std::string& compressedData);
    // Compressed chart text and a binary data stream, which is not copied: it must stay valid for as
    // long as this transformer may read it.
    ChartTransformer(const std::string& compressedXml, const unsigned char* dataStream, unsigned int length);
    ~ChartTransformer() override;
    ChartTransformer(const ChartTransformer&) = delete;
    ChartTransformer& operator=(const ChartTransformer&) = delete;

    // The chart as UTF-8 text, data sources as references; empty without a chart.
    std::string getXML(const XMLCh* encoding = nullptr);
    // The chart with every referenced source put back in place of its reference; a reference with
    // no source in the data is left out.
    std::string getEntireXML(const XMLCh* encoding);
    std::string getCompressedXML();
    // The compressed data document; a held stream is converted once and held in this form after.
    std::string getCompressedData();
    // A new array (release with delete[]) holding the data stream, or null with length 0.
    unsigned char* getCompressedDataStream(unsigned int& length);

    bool applyTemplate(const std::string& templateText);
    // 1 when the popup template was applied (whatever it achieved), 0 when the chart is missing or
    // already has popups.
    unsigned int addPopups();

    // The chart itself, or null; owned by this transformer.
    GrxVisualization* getVisualization() const { return visualization_.get(); }

protected:
    std::string compressDocument(const XERCES_CPP_NAMESPACE::DOMDocument* document);
    // A new empty data document owned by the caller (releaseDocument), or null.
    XERCES_CPP_NAMESPACE::DOMDocument* createDataDocument(const XMLCh* encoding);
    // The data document of the held data, owned by this builder's parser until its next parse; null
    // when there is no data or it cannot be read.
    XERCES_CPP_NAMESPACE::DOMDocument* getDataDocument();

private:
    bool buildVisualization(const std::string& text);
    void moveSourcesToData();
    // The data document and the compressed data of the chart's own sources, made on first demand.
    const XERCES_CPP_NAMESPACE::DOMDocument* madeDataDocument();
    const std::string& compressedData();

    struct MadeData;

    std::unique_ptr<GrxVisualization> visualization_;
    // The sources taken from the chart (nodes of its document, out of its tree), so that the whole
    // document is put together without compressing, decompressing and parsing the data again.
    std::vector<XERCES_CPP_NAMESPACE::DOMElement*> sources_;
    std::unique_ptr<MadeData> madeData_;
    std::string data_;
    const unsigned char* dataStream_ = nullptr;
    unsigned int dataStreamLength_ = 0;
};

#endif

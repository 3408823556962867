// Loading a chart and its data for the tool's chart commands.
#include "ChartInput.h"

#include "Command.h"
#include "foundation/RecordSink.h"

#include <zpack/zpack.h>

namespace plotaid::tool {
namespace {

// XML data starts with markup once any byte-order mark and white space are skipped; a data stream
// (compressed or not) never does.
bool looksLikeXml(const std::string& text) {
    std::size_t at = text.compare(0, 3, "\xEF\xBB\xBF") == 0 ? 3 : 0;
    while (at < text.size() && (text[at] == ' ' || text[at] == '\t' || text[at] == '\r' || text[at] == '\n'))
        ++at;
    return at < text.size() && text[at] == '<';
}

std::string firstRecord(const detail::RecordCollector& records) {
    for (const detail::LogRecord& r : records.records())
        if (r.isError())
            return r.message;
    return records.records().empty() ? std::string() : records.records().front().message;
}

} // namespace

bool isCompressed(const std::string& bytes) {
    return !bytes.empty() && static_cast<unsigned char>(bytes[0]) == 0x78;
}

std::string compressed(const std::string& text) {
    std::string out;
    zpack::compressString(text, out);
    return out;
}

bool ChartInput::load(const std::string& chartPath, const std::string& dataPath, std::string& error) {
    std::string chart;
    if (!readFile(chartPath, chart, error)) {
        error = chartPath + ": " + error;
        return false;
    }
    detail::RecordCollector records;
    if (dataPath.empty()) {
        transformer_ = isCompressed(chart) ? std::make_unique<ChartTransformer>(chart, std::string())
                                           : std::make_unique<ChartTransformer>(chart);
    } else {
        std::string data;
        if (!readFile(dataPath, data, error)) {
            error = dataPath + ": " + error;
            return false;
        }
        std::string plain;
        const bool packed = isCompressed(data);
        if (packed && !zpack::decompressString(plain, data)) {
            error = dataPath + ": the compressed data cannot be decompressed";
            return false;
        }
        const std::string& inner = packed ? plain : data;
        if (!isCompressed(chart))
            chart = compressed(chart);
        hasData_ = true;
        if (looksLikeXml(inner)) {
            transformer_ = std::make_unique<ChartTransformer>(chart, packed ? data : compressed(data));
        } else {
            stream_ = packed ? data : compressed(data);
            transformer_ = std::make_unique<ChartTransformer>(
                chart, reinterpret_cast<const unsigned char*>(stream_.data()),
                static_cast<unsigned>(stream_.size()));
        }
    }
    if (transformer_->getVisualization() == nullptr) {
        const std::string why = firstRecord(records);
        error = chartPath + ": the chart cannot be read" + (why.empty() ? std::string() : ": " + why);
        return false;
    }
    return true;
}

} // namespace plotaid::tool

// Data streams from anywhere: compressed, raw, or (first byte 'Z') a raw layout that the harness
// compresses first, so that the fuzzer reaches the layout checks behind the inflate.
#include <plotaid/VarDataProcessor.h>
#include <plotaid/XmlDataHandler.h>

#include <zpack/zpack.h>

#include <climits>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

namespace {

void sameShape(VarDataProcessor& a, VarDataProcessor& b) {
    std::vector<std::string> sa, sb;
    if (a.GetSourceNames(sa) != b.GetSourceNames(sb) || sa != sb)
        std::abort();
    for (const std::string& s : sa)
        if (a.GetRowCount(s) != b.GetRowCount(s))
            std::abort();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const bool limited = (zpack::setDecompressionLimit(std::size_t(64) << 20), true);
    (void)limited;
    if (size > (std::size_t(16) << 20))
        return 0;
    std::string input(reinterpret_cast<const char*>(data), size);
    if (!input.empty() && input[0] == 'Z') {
        std::string packed;
        if (!zpack::compressString(input.substr(1), packed))
            return 0;
        input.swap(packed);
    }
    VarDataProcessor store;
    if (!store.ReadStreamData(input.empty() ? nullptr : &input[0], static_cast<unsigned>(input.size())))
        return 0;

    // What was read must be written and read back alike, and convert to XML data.
    unsigned length = 0;
    std::unique_ptr<unsigned char[]> stream(store.GetDataStream(length));
    if (!stream)
        return 0; // more than a stream can hold after names were cut to duplicates
    VarDataProcessor again;
    if (!again.ReadStreamData(stream.get(), length))
        std::abort();
    sameShape(store, again);
    XmlDataHandler handler(stream.get(), length);
    std::string xml;
    if (!handler.GetXmlData(xml, false))
        std::abort();
    XmlDataHandler back(xml);
    unsigned backLength = 0;
    std::unique_ptr<unsigned char[]> fromXml(back.GetDataStream(backLength));
    if (fromXml) {
        VarDataProcessor third;
        if (!third.ReadStreamData(fromXml.get(), backLength))
            std::abort();
    }
    return 0;
}

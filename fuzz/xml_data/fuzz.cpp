// XML data of either form, plain or compressed, to a data stream and back to XML data.
#include <plotaid/VarDataProcessor.h>
#include <plotaid/XmlDataHandler.h>

#include <zpack/zpack.h>

#include <cstdint>
#include <cstdlib>
#include <memory>
#include <string>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static const bool limited = (zpack::setDecompressionLimit(std::size_t(64) << 20), true);
    (void)limited;
    if (size > (std::size_t(4) << 20))
        return 0;
    const std::string xml(reinterpret_cast<const char*>(data), size);
    XmlDataHandler handler(xml);
    unsigned length = 0;
    std::unique_ptr<unsigned char[]> stream(handler.GetDataStream(length));
    std::string text;
    handler.GetXmlData(text, size % 2 == 0);
    if (!stream) {
        if (length != 0)
            std::abort();
        return 0;
    }
    // A stream the reader made is always readable, and its XML data read again is too.
    VarDataProcessor store;
    if (!store.ReadStreamData(stream.get(), length))
        std::abort();
    XmlDataHandler fromStream(stream.get(), length);
    std::string again;
    if (!fromStream.GetXmlData(again, false))
        std::abort();
    XmlDataHandler second(again);
    unsigned secondLength = 0;
    std::unique_ptr<unsigned char[]> secondStream(second.GetDataStream(secondLength));
    if (secondStream) {
        VarDataProcessor check;
        if (!check.ReadStreamData(secondStream.get(), secondLength))
            std::abort();
    }
    return 0;
}

#ifndef PLOTAID_TESTS_CHARTDATA_TESTSTREAMS_H
#define PLOTAID_TESTS_CHARTDATA_TESTSTREAMS_H

#include "foundation/RecordSink.h"

#include <plotaid/VarDataProcessor.h>

#include <zpack/zpack.h>

#include <cstdint>
#include <cstring>
#include <initializer_list>
#include <limits>
#include <memory>
#include <string>

// Helpers for building and taking apart data streams by hand.
namespace chartdata_test {

inline const double kMissing = -std::numeric_limits<double>::max();

struct Stream {
    std::unique_ptr<unsigned char[]> bytes;
    unsigned length = 0;
};

inline Stream streamOf(VarDataProcessor& store) {
    Stream s;
    s.bytes.reset(store.GetDataStream(s.length));
    return s;
}

inline std::string rawOf(const Stream& s) {
    std::string raw;
    zpack::decompressString(raw, std::string(reinterpret_cast<const char*>(s.bytes.get()), s.length));
    return raw;
}

inline std::string compressed(const std::string& raw) {
    std::string out;
    zpack::compressString(raw, out);
    return out;
}

inline bool readInto(VarDataProcessor& store, const std::string& bytes) {
    std::string copy = bytes; // the reader must not look past what it is given
    return store.ReadStreamData(copy.empty() ? nullptr : &copy[0], static_cast<unsigned>(copy.size()));
}

inline std::uint32_t u32At(const std::string& raw, std::size_t at) {
    std::uint32_t v = 0;
    for (int i = 3; i >= 0; --i)
        v = v << 8 | static_cast<unsigned char>(raw.at(at + i));
    return v;
}

inline void appendU32(std::string& out, std::initializer_list<std::uint32_t> values, bool bigEndian = false) {
    for (std::uint32_t v : values)
        for (int i = 0; i < 4; ++i)
            out += static_cast<char>(v >> (bigEndian ? 24 - 8 * i : 8 * i) & 0xFF);
}

inline void appendDouble(std::string& out, double v, bool bigEndian = false) {
    unsigned char b[8];
    std::memcpy(b, &v, 8);
    for (int i = 0; i < 8; ++i)
        out += static_cast<char>(b[bigEndian ? 7 - i : i]);
}

inline void appendField(std::string& out, const std::string& name, std::size_t size) {
    std::string field = name;
    field.resize(size, '\0');
    out += field;
}

} // namespace chartdata_test

#endif

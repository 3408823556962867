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

// A name in its fixed-size field, zero-padded.
inline void appendField(std::string& out, const std::string& name, std::size_t size) {
    out += name + std::string(size - name.size(), '\0');
}

} // namespace chartdata_test

#endif

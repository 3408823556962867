#include <zpack/zpack.h>

#include <zlib.h>

#include <algorithm>
#include <atomic>
#include <climits>

namespace zpack {

namespace {
std::atomic<std::size_t> g_limit{kDefaultDecompressionLimit};

// zlib counts in 32-bit uInt; feed it at most this much per call.
constexpr std::size_t kMaxChunk = std::size_t(1) << 30;
// Deflate cannot expand by more than about 1032:1, so no honest stream justifies more.
constexpr std::size_t kMaxRatio = 1032;

uInt chunk(std::size_t n) { return static_cast<uInt>(std::min(n, kMaxChunk)); }

bool inflateInto(std::string& output, const std::string& compressed, std::size_t initialSize) {
    output.clear();
    const std::size_t limit = g_limit.load(std::memory_order_relaxed);
    z_stream zs{};
    if (inflateInit(&zs) != Z_OK)
        return false;
    struct End {
        z_stream* z;
        ~End() { inflateEnd(z); }
    } end{&zs};

    std::string out;
    out.resize(std::max<std::size_t>(std::min(initialSize, limit), 64));
    std::size_t produced = 0;
    std::size_t consumed = 0;
    int rc = Z_OK;
    while (rc != Z_STREAM_END) {
        if (produced == out.size()) {
            if (out.size() >= limit)
                return false; // would inflate past the cap
            out.resize(std::min(limit, out.size() * 2));
        }
        zs.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(compressed.data() + consumed));
        zs.avail_in = chunk(compressed.size() - consumed);
        zs.next_out = reinterpret_cast<Bytef*>(&out[produced]);
        zs.avail_out = chunk(out.size() - produced);
        const uInt inBefore = zs.avail_in;
        const uInt outBefore = zs.avail_out;
        rc = inflate(&zs, Z_NO_FLUSH);
        consumed += inBefore - zs.avail_in;
        produced += outBefore - zs.avail_out;
        if (rc == Z_STREAM_END)
            break;
        if (rc != Z_OK && rc != Z_BUF_ERROR)
            return false; // bad header, data or checksum
        if (rc == Z_BUF_ERROR && consumed == compressed.size() && produced < out.size())
            return false; // the stream ends early
    }
    if (consumed != compressed.size())
        return false; // trailing bytes after the stream
    out.resize(produced);
    output.swap(out);
    return true;
}
} // namespace

void setDecompressionLimit(std::size_t bytes) { g_limit.store(bytes, std::memory_order_relaxed); }
std::size_t decompressionLimit() { return g_limit.load(std::memory_order_relaxed); }

bool compressString(const std::string& input, std::string& output) {
    output.clear();
    z_stream zs{};
    if (deflateInit(&zs, Z_DEFAULT_COMPRESSION) != Z_OK)
        return false;
    std::string out;
    out.resize(deflateBound(&zs, static_cast<uLong>(std::min<std::size_t>(input.size(), ULONG_MAX))));
    std::size_t consumed = 0;
    std::size_t produced = 0;
    int rc = Z_OK;
    while (rc != Z_STREAM_END) {
        if (produced == out.size())
            out.resize(out.size() * 2 + 64);
        zs.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(input.data() + consumed));
        zs.avail_in = chunk(input.size() - consumed);
        zs.next_out = reinterpret_cast<Bytef*>(&out[produced]);
        zs.avail_out = chunk(out.size() - produced);
        const uInt inBefore = zs.avail_in;
        const uInt outBefore = zs.avail_out;
        const bool last = consumed + inBefore == input.size();
        rc = deflate(&zs, last ? Z_FINISH : Z_NO_FLUSH);
        consumed += inBefore - zs.avail_in;
        produced += outBefore - zs.avail_out;
        if (rc != Z_OK && rc != Z_STREAM_END && rc != Z_BUF_ERROR) {
            deflateEnd(&zs);
            return false;
        }
    }
    deflateEnd(&zs);
    out.resize(produced);
    output.swap(out);
    return true;
}

bool decompressString(std::string& output, const std::string& compressed) {
    return inflateInto(output, compressed, compressed.size() * 4);
}

bool decompressString(std::string& output, const std::string& compressed, unsigned long expectedLength) {
    const std::size_t justified =
        compressed.size() > SIZE_MAX / kMaxRatio ? SIZE_MAX : compressed.size() * kMaxRatio;
    return inflateInto(output, compressed, std::min<std::size_t>(expectedLength + 1, justified));
}

} // namespace zpack

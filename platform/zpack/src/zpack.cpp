#include <zpack/zpack.h>

#include <zlib.h>

#include <algorithm>
#include <atomic>
#include <climits>
#include <memory>
#include <new>

namespace zpack {

namespace {
std::atomic<std::size_t> g_limit{kDefaultDecompressionLimit};

// zlib counts in 32-bit uInt; feed it at most this much per call.
constexpr std::size_t kMaxChunk = std::size_t(1) << 30;
// Output up to this size is written straight into the result. Past it, the rest of the stream is
// inflated once without keeping it, to learn its length (and that it is sound) before anything
// more is allocated, so a stream that would exceed the cap never holds more than this much.
constexpr std::size_t kUnmeasuredOutput = std::size_t(64) << 20;
constexpr std::size_t kMeasureBuffer = std::size_t(64) << 10;
// Deflate cannot expand by more than about 1032:1, so no honest stream justifies a larger start.
constexpr std::size_t kMaxRatio = 1032;

uInt chunk(std::size_t n) {
    return static_cast<uInt>(std::min(n, kMaxChunk));
}

Bytef* bytes(const char* p) {
    return reinterpret_cast<Bytef*>(const_cast<char*>(p));
}

class Inflater {
public:
    Inflater() { ready_ = inflateInit(&zs_) == Z_OK; }
    // Continues where another inflater stands, sharing nothing with it.
    explicit Inflater(Inflater& from) { ready_ = from.ready_ && inflateCopy(&zs_, &from.zs_) == Z_OK; }
    ~Inflater() {
        if (ready_)
            inflateEnd(&zs_);
    }
    Inflater(const Inflater&) = delete;
    Inflater& operator=(const Inflater&) = delete;

    bool ready() const { return ready_; }

    // One inflate call from input[consumed] into [out, out + room); advances both counts.
    int step(const std::string& input, std::size_t& consumed, char* out, std::size_t room,
             std::size_t& produced) {
        zs_.next_in = bytes(input.data() + consumed);
        zs_.avail_in = chunk(input.size() - consumed);
        zs_.next_out = reinterpret_cast<Bytef*>(out);
        zs_.avail_out = chunk(room);
        const uInt inBefore = zs_.avail_in;
        const uInt outBefore = zs_.avail_out;
        const int rc = inflate(&zs_, Z_NO_FLUSH);
        consumed += inBefore - zs_.avail_in;
        produced += outBefore - zs_.avail_out;
        return rc;
    }

private:
    z_stream zs_{};
    bool ready_ = false;
};

// Inflates a copy of the stream from where it stands to its end, keeping nothing: the number of
// bytes still to come, or false when the stream is unsound, has trailing bytes or yields more
// than allowance.
bool measureRest(Inflater& at, const std::string& compressed, std::size_t consumed, std::size_t allowance,
                 std::size_t& rest) {
    Inflater probe(at);
    if (!probe.ready())
        return false;
    std::unique_ptr<char[]> scratch(new char[kMeasureBuffer]);
    rest = 0;
    for (;;) {
        std::size_t produced = 0;
        const int rc = probe.step(compressed, consumed, scratch.get(), kMeasureBuffer, produced);
        rest += produced;
        if (rest > allowance)
            return false;
        if (rc == Z_STREAM_END)
            return consumed == compressed.size();
        if (rc != Z_OK && !(rc == Z_BUF_ERROR && produced == kMeasureBuffer))
            return false;
    }
}

bool inflateInto(std::string& out, const std::string& compressed, std::size_t sizeHint) {
    const std::size_t limit = g_limit.load(std::memory_order_relaxed);
    const std::size_t direct = std::min(limit, kUnmeasuredOutput);
    Inflater inflater;
    if (!inflater.ready())
        return false;
    const std::size_t justified =
        compressed.size() > SIZE_MAX / kMaxRatio - 64 ? SIZE_MAX : compressed.size() * kMaxRatio + 64;
    out.resize(std::min({std::max<std::size_t>(sizeHint, 64), justified, direct}));
    std::size_t produced = 0;
    std::size_t consumed = 0;
    bool measured = false;
    for (;;) {
        if (produced == out.size()) {
            if (!measured && out.size() < direct) {
                out.resize(std::min(direct, out.size() * 2));
            } else if (!measured) {
                std::size_t rest = 0;
                if (!measureRest(inflater, compressed, consumed, limit - produced, rest))
                    return false; // past the cap, or unsound further on
                out.resize(produced + rest);
                measured = true;
            }
        }
        if (produced == out.size()) {
            // Full, yet the trailer may still be unread: that must yield no byte.
            char extra = 0;
            std::size_t none = 0;
            const int rc = inflater.step(compressed, consumed, &extra, 1, none);
            if (rc != Z_STREAM_END || none != 0)
                return false;
            break;
        }
        const int rc = inflater.step(compressed, consumed, &out[produced], out.size() - produced, produced);
        if (rc == Z_STREAM_END)
            break;
        if (rc != Z_OK && rc != Z_BUF_ERROR)
            return false; // bad header, data or checksum
        if (rc == Z_BUF_ERROR && produced < out.size())
            return false; // no progress with room to write: the input ends early
    }
    if (consumed != compressed.size())
        return false; // trailing bytes after the stream
    out.resize(produced);
    return true;
}

bool deflateInto(std::string& out, const std::string& input) {
    z_stream zs{};
    if (deflateInit(&zs, Z_DEFAULT_COMPRESSION) != Z_OK)
        return false;
    struct End {
        z_stream* z;
        ~End() { deflateEnd(z); }
    } end{&zs};
    out.resize(deflateBound(&zs, static_cast<uLong>(std::min<std::size_t>(input.size(), ULONG_MAX))));
    std::size_t consumed = 0;
    std::size_t produced = 0;
    int rc = Z_OK;
    while (rc != Z_STREAM_END) {
        if (produced == out.size())
            out.resize(out.size() * 2 + 64);
        zs.next_in = bytes(input.data() + consumed);
        zs.avail_in = chunk(input.size() - consumed);
        zs.next_out = reinterpret_cast<Bytef*>(&out[produced]);
        zs.avail_out = chunk(out.size() - produced);
        const uInt inBefore = zs.avail_in;
        const uInt outBefore = zs.avail_out;
        const bool last = consumed + inBefore == input.size();
        rc = deflate(&zs, last ? Z_FINISH : Z_NO_FLUSH);
        consumed += inBefore - zs.avail_in;
        produced += outBefore - zs.avail_out;
        if (rc != Z_OK && rc != Z_STREAM_END && rc != Z_BUF_ERROR)
            return false;
    }
    out.resize(produced);
    return true;
}

// The result is built aside and only then handed over, so output may be the input object itself,
// and a failure (out of memory included) leaves the output empty.
template <typename Work> bool deliver(std::string& output, Work work) {
    std::string result;
    bool ok = false;
    try {
        ok = work(result);
    } catch (const std::bad_alloc&) {
        ok = false;
    }
    if (ok)
        output.swap(result);
    else
        output.clear();
    return ok;
}
} // namespace

void setDecompressionLimit(std::size_t bytes) {
    g_limit.store(bytes, std::memory_order_relaxed);
}
std::size_t decompressionLimit() {
    return g_limit.load(std::memory_order_relaxed);
}

bool compressString(const std::string& input, std::string& output) {
    return deliver(output, [&](std::string& out) { return deflateInto(out, input); });
}

bool decompressString(std::string& output, const std::string& compressed) {
    // Chart text usually shrinks four- to tenfold; a low guess costs only a few doublings.
    const std::size_t guess = compressed.size() > SIZE_MAX / 8 ? SIZE_MAX : compressed.size() * 8;
    return deliver(output, [&](std::string& out) { return inflateInto(out, compressed, guess); });
}

bool decompressString(std::string& output, const std::string& compressed, unsigned long expectedLength) {
    // One byte over the expected length lets an honest stream finish without a second allocation.
    const std::size_t hint = expectedLength >= SIZE_MAX ? SIZE_MAX : std::size_t(expectedLength) + 1;
    return deliver(output, [&](std::string& out) { return inflateInto(out, compressed, hint); });
}

} // namespace zpack

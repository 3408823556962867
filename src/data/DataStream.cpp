// The binary data stream: the whole store in one raw layout, compressed as a zlib stream.
//
//   header   8 bytes   byte-order flag, mark 0xB0, sources S (u16), total raw length (u32)
//   table    S x 80    rows R (u32), variables V (u32), offset of the first block (u32), name (65)
//   blocks             per source, V blocks of 288 + 8R: name (288), R cells (IEEE doubles)
//   strings  optional  K sources { len, name, M variables { len, name, E, E x (row, index) } },
//                      T entries { refCount, len, text }; all integers u32
//
// Neither direction builds the raw layout in memory: deflate reads straight from the value arrays
// into the returned array, and inflate writes straight into the value arrays.
#include <plotaid/VarDataProcessor.h>

#include "data/Report.h"
#include "data/StoreAccess.h"

#include <zpack/zpack.h>

#include <zlib.h>

#include <algorithm>
#include <climits>
#include <cstdint>
#include <cstring>
#include <memory>
#include <new>
#include <vector>

#if defined(__BYTE_ORDER__) && __BYTE_ORDER__ != __ORDER_LITTLE_ENDIAN__
#error "the data stream writes cells in memory order, which this build takes to be little-endian"
#endif

using plotaid::detail::guarded;
using plotaid::detail::kMissingValue;
using plotaid::detail::kVarDataFile;
using plotaid::detail::reportFailure;

namespace {

constexpr unsigned char kMark = 0xB0;
constexpr std::uint64_t kHeaderSize = 8;
constexpr std::uint64_t kEntrySize = 80;
constexpr std::size_t kSourceNameMax = 64;
constexpr std::size_t kVariableField = 288;
constexpr std::size_t kVariableNameMax = 287;
// Deflate cannot expand more than 1032:1, so a longer claim is a lie.
constexpr std::uint64_t kMaxInflateRatio = 1032;
constexpr std::size_t kStage = 64 * 1024;

std::uint64_t blockSize(std::uint64_t rows) {
    return kVariableField + 8 * rows;
}

// What a field keeps of a name, and so what a reader gets back: up to the first zero byte, cut.
std::string fieldName(const std::string& name, std::size_t max) {
    return name.substr(0, std::min(max, name.find('\0')));
}

void put32(unsigned char* at, std::uint32_t v) {
    at[0] = static_cast<unsigned char>(v);
    at[1] = static_cast<unsigned char>(v >> 8);
    at[2] = static_cast<unsigned char>(v >> 16);
    at[3] = static_cast<unsigned char>(v >> 24);
}

std::uint32_t get32(const unsigned char* at, bool bigEndian) {
    if (bigEndian)
        return std::uint32_t(at[0]) << 24 | std::uint32_t(at[1]) << 16 | std::uint32_t(at[2]) << 8 | at[3];
    return std::uint32_t(at[3]) << 24 | std::uint32_t(at[2]) << 16 | std::uint32_t(at[1]) << 8 | at[0];
}

std::uint16_t get16(const unsigned char* at, bool bigEndian) {
    return bigEndian ? std::uint16_t(at[0] << 8 | at[1]) : std::uint16_t(at[1] << 8 | at[0]);
}

uInt zchunk(std::size_t n) {
    return static_cast<uInt>(std::min<std::size_t>(n, std::size_t(1) << 30));
}

// Deflates straight into the caller's array. The array is sized for the worst case up front, but
// only the pages that the compressed bytes reach are ever touched, so the memory the stream really
// takes is its compressed size: no chunk list, no second copy at the end.
class DeflateSink {
public:
    explicit DeflateSink(std::uint64_t rawLength) {
        if (deflateInit(&zs_, Z_DEFAULT_COMPRESSION) != Z_OK)
            return;
        size_ = deflateBound(&zs_, static_cast<uLong>(rawLength));
        out_.reset(new (std::nothrow) unsigned char[size_]);
        ok_ = out_ != nullptr;
        stage_.reserve(kStage);
    }
    ~DeflateSink() { deflateEnd(&zs_); }
    DeflateSink(const DeflateSink&) = delete;
    DeflateSink& operator=(const DeflateSink&) = delete;

    bool ok() const { return ok_; }

    void put(const void* data, std::size_t n) {
        if (n >= kStage / 2) {
            flushStage();
            feed(static_cast<const unsigned char*>(data), n, Z_NO_FLUSH);
            return;
        }
        if (stage_.size() + n > kStage)
            flushStage();
        const auto* p = static_cast<const unsigned char*>(data);
        stage_.insert(stage_.end(), p, p + n);
    }
    void put32(std::uint32_t v) {
        unsigned char b[4];
        ::put32(b, v);
        put(b, 4);
    }
    void zeros(std::size_t n) {
        static const unsigned char none[kVariableField] = {};
        while (n > 0) {
            const std::size_t k = std::min(n, sizeof none);
            put(none, k);
            n -= k;
        }
    }

    unsigned char* finish(unsigned& length) {
        flushStage();
        feed(nullptr, 0, Z_FINISH);
        if (!ok_ || !finished_ || produced_ > UINT_MAX)
            return nullptr;
        length = static_cast<unsigned>(produced_);
        return out_.release();
    }

private:
    void flushStage() {
        if (!stage_.empty())
            feed(stage_.data(), stage_.size(), Z_NO_FLUSH);
        stage_.clear();
    }

    void feed(const unsigned char* data, std::size_t n, int flush) {
        std::size_t done = 0;
        while (ok_) {
            const std::size_t pending = n - done;
            zs_.next_in = const_cast<unsigned char*>(data ? data + done : nullptr);
            zs_.avail_in = zchunk(pending);
            zs_.next_out = out_.get() + produced_;
            zs_.avail_out = zchunk(size_ - produced_);
            const uInt inBefore = zs_.avail_in;
            const uInt outBefore = zs_.avail_out;
            const bool last = zs_.avail_in == pending;
            const int rc = deflate(&zs_, last ? flush : Z_NO_FLUSH);
            done += inBefore - zs_.avail_in;
            produced_ += outBefore - zs_.avail_out;
            if (rc == Z_STREAM_END) {
                finished_ = true;
                return;
            }
            if ((rc != Z_OK && rc != Z_BUF_ERROR) || (outBefore == 0 && produced_ == size_)) {
                ok_ = false; // the bound was wrong, or zlib failed
                return;
            }
            if (flush == Z_NO_FLUSH && done == n && zs_.avail_out > 0)
                return;
        }
    }

    z_stream zs_{};
    bool ok_ = false;
    bool finished_ = false;
    std::unique_ptr<unsigned char[]> out_;
    std::size_t size_ = 0;
    std::size_t produced_ = 0;
    std::vector<unsigned char> stage_;
};

// The decompressed stream, read front to back.
class ByteSource {
public:
    virtual ~ByteSource() = default;
    virtual bool read(void* to, std::size_t n) = 0;
    // True when the stream ends exactly here (and, compressed, its checksum holds).
    virtual bool finish() = 0;
};

class MemorySource final : public ByteSource {
public:
    MemorySource(const unsigned char* data, std::size_t size) : data_(data), size_(size) {}
    bool read(void* to, std::size_t n) override {
        if (n > size_ - at_)
            return false;
        if (n == 0)
            return true; // to may be the null data() of an empty table
        std::memcpy(to, data_ + at_, n);
        at_ += n;
        return true;
    }
    bool finish() override { return at_ == size_; }

private:
    const unsigned char* data_;
    std::size_t size_;
    std::size_t at_ = 0;
};

class InflateSource final : public ByteSource {
public:
    InflateSource(const unsigned char* data, unsigned length) {
        ok_ = inflateInit(&zs_) == Z_OK;
        zs_.next_in = const_cast<unsigned char*>(data);
        zs_.avail_in = length;
    }
    ~InflateSource() override { inflateEnd(&zs_); }
    InflateSource(const InflateSource&) = delete;
    InflateSource& operator=(const InflateSource&) = delete;

    bool ok() const { return ok_; }

    bool read(void* to, std::size_t n) override {
        auto* out = static_cast<unsigned char*>(to);
        while (n > 0) {
            if (!ok_ || ended_)
                return false;
            zs_.next_out = out;
            zs_.avail_out = zchunk(n);
            const uInt before = zs_.avail_out;
            const int rc = inflate(&zs_, Z_NO_FLUSH);
            const std::size_t got = before - zs_.avail_out;
            out += got;
            n -= got;
            if (rc == Z_STREAM_END)
                ended_ = true;
            else if (rc != Z_OK)
                return ok_ = false; // corrupt, or the compressed bytes end early
        }
        return true;
    }

    bool finish() override {
        if (!ok_)
            return false;
        if (!ended_) {
            unsigned char extra;
            zs_.next_out = &extra;
            zs_.avail_out = 1;
            const int rc = inflate(&zs_, Z_NO_FLUSH);
            if (rc != Z_STREAM_END || zs_.avail_out == 0)
                return false;
            ended_ = true;
        }
        return zs_.avail_in == 0;
    }

private:
    z_stream zs_{};
    bool ok_ = false;
    bool ended_ = false;
};

// Reads the string section through a small buffer, never past the section's declared end.
class SectionReader {
public:
    SectionReader(ByteSource& source, std::uint64_t size, bool bigEndian)
        : source_(source), left_(size), bigEndian_(bigEndian) {}

    bool u32(std::uint32_t& v) {
        unsigned char b[4];
        if (!bytes(b, 4))
            return false;
        v = get32(b, bigEndian_);
        return true;
    }
    bool text(std::string& s, std::uint32_t n) {
        if (n > remaining())
            return false;
        s.clear();
        // Grow with the bytes that really arrive rather than with the claim.
        while (s.size() < n) {
            const std::size_t k = std::min<std::size_t>(n - s.size(), kStage);
            const std::size_t at = s.size();
            s.resize(at + k);
            if (!bytes(&s[at], k))
                return false;
        }
        return true;
    }
    std::uint64_t remaining() const { return left_ + (buf_.size() - at_); }

private:
    bool bytes(void* to, std::size_t n) {
        auto* out = static_cast<unsigned char*>(to);
        while (n > 0) {
            if (at_ == buf_.size() && !refill())
                return false;
            const std::size_t k = std::min(n, buf_.size() - at_);
            std::memcpy(out, buf_.data() + at_, k);
            at_ += k;
            out += k;
            n -= k;
        }
        return true;
    }
    bool refill() {
        if (left_ == 0)
            return false;
        const std::size_t k = static_cast<std::size_t>(std::min<std::uint64_t>(left_, kStage));
        buf_.resize(k);
        at_ = 0;
        if (!source_.read(buf_.data(), k))
            return false;
        left_ -= k;
        return true;
    }

    ByteSource& source_;
    std::uint64_t left_;
    bool bigEndian_;
    std::vector<unsigned char> buf_;
    std::size_t at_ = 0;
};

std::uint64_t stringSectionSize(const VarDataProcessor& store) {
    using Access = plotaid::detail::StoreAccess;
    bool any = false;
    std::uint64_t size = 4;
    for (const auto& [source, maps] : Access::stringMaps(store)) {
        size += 8 + fieldName(source, kSourceNameMax).size();
        for (const auto& [variable, map] : maps) {
            size += 8 + fieldName(variable, kVariableNameMax).size() + 8 * std::uint64_t(map.size());
            any = any || !map.empty();
        }
    }
    if (!any)
        return 0;
    size += 4;
    for (const auto& entry : Access::strings(store))
        size += 8 + entry.text.size();
    return size;
}

} // namespace

unsigned VarDataProcessor::StringDataSize() const {
    return static_cast<unsigned>(std::min<std::uint64_t>(stringSectionSize(*this), UINT_MAX));
}

void VarDataProcessor::SwapBytes(char* bytes, int count) {
    if (bytes && count > 1)
        std::reverse(bytes, bytes + count);
}

unsigned char* VarDataProcessor::GetDataStream(unsigned& length) {
    length = 0;
    unsigned char* const none = nullptr;
    unsigned char* const built = guarded(kVarDataFile, __LINE__, "cannot build the data stream", none, [&]() -> unsigned char* {
        if (sources.size() > 0xFFFF) {
            reportFailure("too many data sources for a data stream", kVarDataFile, __LINE__);
            return nullptr;
        }
        const auto count = static_cast<std::uint32_t>(sources.size());
        std::vector<std::uint32_t> rows;
        rows.reserve(count);
        std::uint64_t total = kHeaderSize + kEntrySize * count;
        for (const auto& [name, bag] : sources) {
            rows.push_back(GetRowCount(name));
            total += bag.variables.size() * blockSize(rows.back());
        }
        const std::uint64_t stringSize = stringSectionSize(*this);
        total += stringSize;
        if (total > UINT_MAX) {
            reportFailure("the data are too large for a data stream", kVarDataFile, __LINE__);
            return nullptr;
        }

        DeflateSink sink(total);
        if (!sink.ok()) {
            reportFailure("cannot allocate the data stream", kVarDataFile, __LINE__);
            return nullptr;
        }
        unsigned char header[kHeaderSize] = {static_cast<unsigned char>(byteOrderFlag ? 1 : 0), kMark,
                                             static_cast<unsigned char>(count & 0xFF),
                                             static_cast<unsigned char>(count >> 8)};
        put32(header + 4, static_cast<std::uint32_t>(total));
        sink.put(header, sizeof header);

        std::uint64_t offset = kHeaderSize + kEntrySize * count;
        std::size_t i = 0;
        for (const auto& [name, bag] : sources) {
            unsigned char entry[kEntrySize] = {};
            put32(entry, rows[i]);
            put32(entry + 4, static_cast<std::uint32_t>(bag.variables.size()));
            put32(entry + 8, static_cast<std::uint32_t>(offset));
            const std::string field = fieldName(name, kSourceNameMax);
            std::memcpy(entry + 12, field.data(), field.size());
            sink.put(entry, sizeof entry);
            offset += bag.variables.size() * blockSize(rows[i]);
            ++i;
        }

        i = 0;
        for (const auto& [name, bag] : sources) {
            const std::uint32_t r = rows[i++];
            for (const auto& [variable, column] : bag.variables) {
                const std::string field = fieldName(variable, kVariableNameMax);
                sink.put(field.data(), field.size());
                sink.zeros(kVariableField - field.size());
                const std::uint32_t held = std::min(r, bag.capacity);
                sink.put(column.values.data(), std::size_t(held) * sizeof(double));
                for (std::uint32_t k = held; k < r; ++k)
                    sink.put(&kMissingValue, sizeof(double));
            }
        }

        if (stringSize > 0) {
            sink.put32(static_cast<std::uint32_t>(stringMaps.size()));
            for (const auto& [source, maps] : stringMaps) {
                const std::string name = fieldName(source, kSourceNameMax);
                sink.put32(static_cast<std::uint32_t>(name.size()));
                sink.put(name.data(), name.size());
                sink.put32(static_cast<std::uint32_t>(maps.size()));
                for (const auto& [variable, map] : maps) {
                    const std::string var = fieldName(variable, kVariableNameMax);
                    sink.put32(static_cast<std::uint32_t>(var.size()));
                    sink.put(var.data(), var.size());
                    sink.put32(static_cast<std::uint32_t>(map.size()));
                    for (const auto& [row, index] : map) {
                        sink.put32(row);
                        sink.put32(index);
                    }
                }
            }
            sink.put32(static_cast<std::uint32_t>(strings.size()));
            for (const auto& entry : strings) {
                sink.put32(entry.refCount);
                sink.put32(static_cast<std::uint32_t>(entry.text.size()));
                sink.put(entry.text.data(), entry.text.size());
            }
        }

        unsigned char* out = sink.finish(length);
        if (!out) {
            length = 0;
            reportFailure("cannot compress the data stream", kVarDataFile, __LINE__);
        }
        return out;
    });
    if (built == nullptr)
        length = 0;
    return built;
}

namespace {

struct TableEntry {
    std::uint32_t rows;
    std::uint32_t variables;
    std::string name;
};

struct ParsedStrings {
    std::vector<std::pair<std::string, std::vector<std::pair<std::string, VarDataProcessor::StringMap>>>>
        maps;
    std::vector<VarDataProcessor::_stringentry> table;
};

bool readStringSection(SectionReader& in, ParsedStrings& out) {
    std::uint32_t sourceCount = 0;
    if (!in.u32(sourceCount))
        return false;
    for (std::uint32_t s = 0; s < sourceCount; ++s) {
        std::uint32_t n = 0, variableCount = 0;
        std::string source;
        if (!in.u32(n) || !in.text(source, n) || !in.u32(variableCount))
            return false;
        out.maps.emplace_back(std::move(source),
                              std::vector<std::pair<std::string, VarDataProcessor::StringMap>>());
        auto& variables = out.maps.back().second;
        for (std::uint32_t v = 0; v < variableCount; ++v) {
            std::string variable;
            std::uint32_t entries = 0;
            if (!in.u32(n) || !in.text(variable, n) || !in.u32(entries))
                return false;
            if (entries > in.remaining() / 8)
                return false;
            variables.emplace_back(std::move(variable), VarDataProcessor::StringMap());
            auto& map = variables.back().second;
            for (std::uint32_t e = 0; e < entries; ++e) {
                std::uint32_t row = 0, index = 0;
                if (!in.u32(row) || !in.u32(index))
                    return false;
                map.emplace_hint(map.end(), row, index);
            }
        }
    }
    std::uint32_t tableSize = 0;
    if (!in.u32(tableSize) || tableSize > in.remaining() / 8)
        return false;
    // Entries are taken as they arrive: the count alone justifies no memory.
    for (std::uint32_t k = 0; k < tableSize; ++k) {
        VarDataProcessor::_stringentry entry;
        std::uint32_t n = 0;
        if (!in.u32(entry.refCount) || !in.u32(n) || !in.text(entry.text, n))
            return false;
        out.table.push_back(std::move(entry));
    }
    return in.remaining() == 0;
}

} // namespace

bool VarDataProcessor::ReadStreamData(void* data, unsigned length) {
    Reset();
    bool ended = false; // without an exception
    const bool read = guarded(kVarDataFile, __LINE__, "cannot read the data stream", false, [&] {
        const bool r = ReadStream(data, length);
        ended = true;
        return r;
    });
    if (!ended)
        Reset();
    return read;
}

bool VarDataProcessor::ReadStream(void* data, unsigned length) {
    {
        const auto* bytes = static_cast<const unsigned char*>(data);
        if (!bytes || length < 2) {
            reportFailure("empty data stream", kVarDataFile, __LINE__);
            return false;
        }
        // A raw layout (what a writer sends when it could not compress) can never pass for a
        // zlib stream, whose first byte names the deflate method.
        std::unique_ptr<ByteSource> source;
        std::uint64_t limit = 0;
        if (bytes[0] <= 1 && bytes[1] == kMark) {
            source = std::make_unique<MemorySource>(bytes, length);
            limit = length;
        } else {
            auto inflater = std::make_unique<InflateSource>(bytes, length);
            if (!inflater->ok())
                return false;
            source = std::move(inflater);
            limit = std::min<std::uint64_t>(std::uint64_t(length) * kMaxInflateRatio,
                                            zpack::decompressionLimit());
        }
        auto fail = [this](const char* why, unsigned line) {
            Reset();
            reportFailure(std::string("bad data stream: ") + why, kVarDataFile, line);
            return false;
        };

        unsigned char header[kHeaderSize];
        if (!source->read(header, sizeof header))
            return fail("truncated header", __LINE__);
        if (header[1] != kMark || header[0] > 1)
            return fail("no data stream mark", __LINE__);
        const bool swap = (header[0] != 0) != byteOrderFlag;
        const bool bigEndian = swap ? !byteOrderFlag : byteOrderFlag;
        const std::uint32_t count = get16(header + 2, bigEndian);
        const std::uint32_t total = get32(header + 4, bigEndian);
        if (total > limit || total < kHeaderSize + kEntrySize * count)
            return fail("length does not match the stream", __LINE__);

        std::vector<unsigned char> table(kEntrySize * count);
        if (!source->read(table.data(), table.size()))
            return fail("truncated table", __LINE__);
        std::vector<TableEntry> entries(count);
        std::uint64_t expected = kHeaderSize + kEntrySize * count;
        for (std::uint32_t s = 0; s < count; ++s) {
            const unsigned char* e = table.data() + kEntrySize * s;
            TableEntry& t = entries[s];
            t.rows = get32(e, bigEndian);
            t.variables = get32(e + 4, bigEndian);
            if (get32(e + 8, bigEndian) != expected)
                return fail("block offset out of place", __LINE__);
            const char* name = reinterpret_cast<const char*>(e + 12);
            t.name.assign(name, strnlen(name, kSourceNameMax));
            // Divided rather than multiplied: V x (288 + 8R) can pass 2^64 and wrap.
            if (t.variables > 0 && blockSize(t.rows) > (total - expected) / t.variables)
                return fail("blocks reach past the stream's end", __LINE__);
            expected += std::uint64_t(t.variables) * blockSize(t.rows);
        }
        table.clear();
        table.shrink_to_fit();

        for (const TableEntry& t : entries) {
            // The arrays grow with the cells that arrive, never ahead of them on the table's word.
            AddDataSource(t.name, 0);
            _sourcebag& bag = sources[t.name];
            for (std::uint32_t v = 0; v < t.variables; ++v) {
                char field[kVariableField];
                if (!source->read(field, sizeof field))
                    return fail("truncated variable block", __LINE__);
                const std::string name(field, strnlen(field, kVariableNameMax));
                AddVariable(t.name, name, nullptr);
                auto var = bag.variables.find(name);
                if (var == bag.variables.end())
                    return fail("cannot allocate the data", __LINE__);
                _column& column = var->second;
                for (std::uint32_t done = 0; done < t.rows;) {
                    const std::uint32_t k = std::min<std::uint32_t>(t.rows - done, kStage / sizeof(double));
                    if (!ReallocBag(bag, done + k))
                        return fail("cannot allocate the data", __LINE__);
                    if (!source->read(column.values.data() + done, std::size_t(k) * sizeof(double)))
                        return fail("truncated cells", __LINE__);
                    done += k;
                }
                if (swap) {
                    for (std::uint32_t r = 0; r < t.rows; ++r)
                        SwapBytes(reinterpret_cast<char*>(column.values.data() + r), sizeof(double));
                }
                column.rowCount = std::max(column.rowCount, t.rows);
            }
        }

        bool stringsRead = true;
        if (total > expected) {
            SectionReader in(*source, total - expected, bigEndian);
            ParsedStrings parsed;
            stringsRead = readStringSection(in, parsed);
            if (!stringsRead) {
                reportFailure("bad data stream: unreadable string section", kVarDataFile, __LINE__);
                return false; // the numbers read so far stay
            }
            // Every variable keeps a string map; only maps of variables that exist are taken, and
            // reference counts are recounted, so the table cannot disagree with the maps.
            for (auto& [name, maps] : stringMaps)
                for (auto& [variable, map] : maps)
                    map.clear();
            std::vector<std::uint32_t> refs(parsed.table.size(), 0);
            for (auto& [name, variables] : parsed.maps) {
                auto bag = sources.find(name);
                if (bag == sources.end())
                    continue;
                for (auto& [variable, map] : variables) {
                    if (!bag->second.variables.count(variable))
                        continue;
                    for (const auto& [row, index] : map) {
                        if (index == NoString)
                            continue;
                        if (index >= refs.size()) {
                            for (auto& [n, maps] : stringMaps)
                                for (auto& [var, m] : maps)
                                    m.clear();
                            reportFailure("bad data stream: string index out of range", kVarDataFile,
                                            __LINE__);
                            return false;
                        }
                        ++refs[index];
                    }
                    stringMaps[name][variable] = std::move(map);
                }
            }
            for (std::size_t k = 0; k < parsed.table.size(); ++k) {
                parsed.table[k].refCount = refs[k];
                if (refs[k] == 0)
                    std::string().swap(parsed.table[k].text);
            }
            strings = std::move(parsed.table);
            IndexStrings();
        }
        if (!source->finish())
            return fail("the stream does not end where its length says", __LINE__);
        return stringsRead;
    }
}

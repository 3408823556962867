#include <zpack/zpack.h>

#include <zlib.h>

#include <gtest/gtest.h>

#include <climits>
#include <cstdint>
#include <fstream>
#include <random>
#include <string>

namespace {

// Puts the process-wide cap back after a test changes it.
class ZpackLimit : public ::testing::Test {
protected:
    void TearDown() override { zpack::setDecompressionLimit(zpack::kDefaultDecompressionLimit); }
};

std::string compressed(const std::string& text) {
    std::string out;
    EXPECT_TRUE(zpack::compressString(text, out));
    return out;
}

// Without a length hint when `hint` is negative.
bool inflate(std::string& out, const std::string& packed, long hint) {
    return hint < 0 ? zpack::decompressString(out, packed) : zpack::decompressString(out, packed, hint);
}

std::string randomBytes(std::size_t size, unsigned seed) {
    std::mt19937 rng(seed);
    std::string bytes(size, '\0');
    for (char& c : bytes)
        c = static_cast<char>(rng() & 0xFF);
    return bytes;
}

// Text that compresses like chart XML but is not trivially repetitive.
std::string chartLikeText(std::size_t size) {
    std::string text;
    text.reserve(size + 64);
    std::mt19937 rng(7);
    for (unsigned row = 0; text.size() < size; ++row)
        text += "<value row=\"" + std::to_string(row) + "\" v=\"" + std::to_string(rng() % 100000) + "\"/>\n";
    text.resize(size);
    return text;
}

// A zlib stream of `megabytes` MiB of zeros, built without ever holding the zeros: one
// independently compressed MiB, repeated, then a final empty block and the checksum.
std::string zeroStream(std::uint64_t megabytes) {
    const std::string mib(std::size_t(1) << 20, '\0');
    z_stream zs{};
    EXPECT_EQ(deflateInit2(&zs, 9, Z_DEFLATED, -15, 8, Z_DEFAULT_STRATEGY), Z_OK);
    std::string block(deflateBound(&zs, mib.size()) + 64, '\0');
    zs.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(mib.data()));
    zs.avail_in = static_cast<uInt>(mib.size());
    zs.next_out = reinterpret_cast<Bytef*>(&block[0]);
    zs.avail_out = static_cast<uInt>(block.size());
    EXPECT_EQ(deflate(&zs, Z_FULL_FLUSH), Z_OK); // byte-aligned, no reference to earlier data
    EXPECT_EQ(zs.avail_in, 0u);
    block.resize(block.size() - zs.avail_out);
    deflateEnd(&zs);

    std::string stream = "\x78\x9C";
    stream.reserve(2 + block.size() * megabytes + 6);
    for (std::uint64_t i = 0; i < megabytes; ++i)
        stream += block;
    stream += std::string("\x03\x00", 2); // final, empty fixed-code block
    // Adler-32 of n zeros: a stays 1, b adds 1 per byte.
    const std::uint64_t n = megabytes << 20;
    const std::uint32_t adler = static_cast<std::uint32_t>((n % 65521) << 16 | 1);
    for (int shift = 24; shift >= 0; shift -= 8)
        stream += static_cast<char>((adler >> shift) & 0xFF);
    return stream;
}

// Growth of the peak resident size while `work` runs; -1 where the kernel cannot reset the peak.
template <typename Work> long peakGrowthKiB(Work work) {
    auto field = [](const char* name) {
        std::ifstream status("/proc/self/status");
        std::string line;
        while (std::getline(status, line))
            if (line.rfind(name, 0) == 0)
                return std::stol(line.substr(std::string(name).size()));
        return -1L;
    };
    std::ofstream reset("/proc/self/clear_refs");
    reset << "5" << std::flush;
    if (!reset)
        return -1;
    const long before = field("VmRSS:");
    work();
    return field("VmHWM:") - before;
}

} // namespace

TEST(ZpackRoundTrip, BinaryTextsComeBackByteForByte) {
    const std::string inputs[] = {
        "",
        std::string("a\0b\0\0c", 6),
        randomBytes(100000, 1), // every byte value; incompressible: output larger than input
        // Long enough that the tail is measured before it is allocated.
        chartLikeText((std::size_t(64) << 20) + 123457),
    };
    for (const std::string& input : inputs) {
        std::string packed;
        ASSERT_TRUE(zpack::compressString(input, packed)) << input.size();
        std::string back = "stale";
        ASSERT_TRUE(zpack::decompressString(back, packed)) << input.size();
        EXPECT_TRUE(back == input) << input.size();
        std::string hinted;
        ASSERT_TRUE(zpack::decompressString(hinted, packed, input.size()));
        EXPECT_TRUE(hinted == input) << input.size();
    }
    // The output may be the input object.
    const std::string text = randomBytes(2560, 2);
    std::string s = text;
    ASSERT_TRUE(zpack::compressString(s, s));
    EXPECT_EQ(static_cast<unsigned char>(s[0]), 0x78);
    ASSERT_TRUE(zpack::decompressString(s, s));
    EXPECT_EQ(s, text);
}

TEST(ZpackBadInput, DamagedStreamsFailWithEmptyOutput) {
    const std::string good = compressed(chartLikeText(50000));
    std::string badChecksum = good;
    badChecksum.back() ^= 1;
    const std::pair<const char*, std::string> cases[] = {
        {"empty", ""},
        {"header only", good.substr(0, 2)},
        {"truncated by one byte", good.substr(0, good.size() - 1)},
        {"truncated in the middle", good.substr(0, good.size() / 2)},
        {"trailing garbage", good + "x"},
        {"two streams", good + good},
        {"bad checksum", badChecksum},
        {"not zlib", "<chart>plain text</chart>"},
    };
    for (const auto& [what, bytes] : cases)
        for (long hint : {-1L, 50000L}) {
            std::string out = "previous content";
            EXPECT_FALSE(inflate(out, bytes, hint)) << what << " " << hint;
            EXPECT_TRUE(out.empty()) << what;
        }
}

TEST_F(ZpackLimit, OutputUpToTheCapExactly) {
    EXPECT_EQ(zpack::decompressionLimit(), std::size_t(1) << 30);
    const std::string text = randomBytes(1000, 3);
    struct Case {
        std::size_t cap;
        std::string text;
        bool fits;
    };
    // 10: a cap below any buffer size the wrapper might start with.
    const Case cases[] = {{1000, text, true},         {999, text, false}, {10, "ten chars!", true},
                          {10, "eleven char", false}, {0, "", true},      {0, "x", false}};
    for (const Case& c : cases)
        for (long hint : {-1L, 1000L}) {
            SCOPED_TRACE(testing::Message() << c.cap << " " << c.text.size() << " " << hint);
            zpack::setDecompressionLimit(c.cap);
            std::string out = "stale";
            EXPECT_EQ(inflate(out, compressed(c.text), hint), c.fits);
            EXPECT_EQ(out, c.fits ? c.text : std::string());
        }
}

// Past the directly written part the cap still holds to the byte, and a stream that would exceed it
// is refused after measuring, without ever holding much more than that part.
TEST_F(ZpackLimit, CapAppliesPastTheDirectlyWrittenPartWithLittleMemory) {
    const std::string stream = zeroStream(80);
    std::string out;
    ASSERT_TRUE(zpack::decompressString(out, stream)); // the hand-built stream is sound
    EXPECT_EQ(out.size(), std::size_t(80) << 20);
    EXPECT_EQ(out.find_first_not_of('\0'), std::string::npos);
    zpack::setDecompressionLimit((std::size_t(80) << 20) - 1);
    EXPECT_FALSE(zpack::decompressString(out, stream));
    EXPECT_TRUE(out.empty());
    zpack::setDecompressionLimit(std::size_t(80) << 20);
    EXPECT_TRUE(zpack::decompressString(out, stream, 1));

    const std::string bomb = zeroStream(256);
    zpack::setDecompressionLimit(std::size_t(128) << 20);
    std::string().swap(out);
    bool refused = true;
    const long growthKiB = peakGrowthKiB([&] {
        refused = !zpack::decompressString(out, bomb) && out.empty();
        refused =
            !zpack::decompressString(out, bomb, 1UL << 30) && out.empty() && refused; // a claim is no licence
    });
    EXPECT_TRUE(refused);
    RecordProperty("peak_growth_kib", static_cast<int>(growthKiB));
#ifndef __SANITIZE_ADDRESS__ // the sanitizer's quarantine holds freed blocks and inflates the peak
    if (growthKiB >= 0) {
        EXPECT_LT(growthKiB, 100L << 10) << "peak resident size grew by " << growthKiB << " KiB";
    }
#endif
}

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

std::string allByteValues(std::size_t repeats) {
    std::string bytes;
    for (std::size_t r = 0; r < repeats; ++r)
        for (int b = 0; b < 256; ++b)
            bytes += static_cast<char>(b);
    return bytes;
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
        std::string("\0", 1),
        std::string("a\0b\0\0c", 6),
        allByteValues(1),
        allByteValues(300),
        randomBytes(100000, 1), // incompressible: output larger than input
        chartLikeText(3 << 20),
    };
    for (const std::string& input : inputs) {
        std::string packed;
        ASSERT_TRUE(zpack::compressString(input, packed)) << input.size();
        ASSERT_GE(packed.size(), 2u);
        EXPECT_EQ(static_cast<unsigned char>(packed[0]), 0x78);
        std::string back = "stale";
        ASSERT_TRUE(zpack::decompressString(back, packed)) << input.size();
        EXPECT_EQ(back, input);
        std::string hinted;
        ASSERT_TRUE(zpack::decompressString(hinted, packed, input.size()));
        EXPECT_EQ(hinted, input);
    }
}

TEST(ZpackRoundTrip, ReadsStreamsOfPlainZlib) {
    const std::string text = chartLikeText(200000);
    std::string packed(compressBound(text.size()), '\0');
    uLongf size = packed.size();
    ASSERT_EQ(compress2(reinterpret_cast<Bytef*>(&packed[0]), &size,
                        reinterpret_cast<const Bytef*>(text.data()), text.size(), Z_BEST_COMPRESSION),
              Z_OK);
    packed.resize(size);
    std::string back;
    ASSERT_TRUE(zpack::decompressString(back, packed));
    EXPECT_EQ(back, text);
}

TEST(ZpackRoundTrip, OutputMayBeTheInputObject) {
    const std::string text = allByteValues(10);
    std::string s = text;
    ASSERT_TRUE(zpack::compressString(s, s));
    EXPECT_EQ(static_cast<unsigned char>(s[0]), 0x78);
    ASSERT_TRUE(zpack::decompressString(s, s));
    EXPECT_EQ(s, text);
}

TEST(ZpackRoundTrip, LargeOutputPastTheDirectlyWrittenPart) {
    // Long enough that the tail is measured before it is allocated.
    const std::string text = chartLikeText((std::size_t(64) << 20) + 123457);
    const std::string packed = compressed(text);
    std::string back;
    ASSERT_TRUE(zpack::decompressString(back, packed));
    EXPECT_TRUE(back == text);
    back.clear();
    ASSERT_TRUE(zpack::decompressString(back, packed, text.size()));
    EXPECT_TRUE(back == text);
}

TEST(ZpackBadInput, DamagedStreamsFailWithEmptyOutput) {
    const std::string good = compressed(chartLikeText(50000));
    std::string badChecksum = good;
    badChecksum.back() = static_cast<char>(badChecksum.back() ^ 1);
    std::string badData = good;
    badData[good.size() / 2] = static_cast<char>(badData[good.size() / 2] ^ 0x55);
    std::string badHeader = good;
    badHeader[1] = static_cast<char>(badHeader[1] ^ 1); // header check bits no longer match
    struct Case {
        const char* what;
        std::string bytes;
    };
    const Case cases[] = {
        {"empty", ""},
        {"header only", good.substr(0, 2)},
        {"truncated by one byte", good.substr(0, good.size() - 1)},
        {"truncated in the middle", good.substr(0, good.size() / 2)},
        {"trailing garbage", good + "x"},
        {"two streams", good + good},
        {"bad checksum", badChecksum},
        {"bad data", badData},
        {"bad header", badHeader},
        {"not zlib", "<chart>plain text</chart>"},
        {"raw deflate without header", good.substr(2)},
    };
    for (const Case& c : cases) {
        std::string out = "previous content";
        EXPECT_FALSE(zpack::decompressString(out, c.bytes)) << c.what;
        EXPECT_TRUE(out.empty()) << c.what;
        out = "previous content";
        EXPECT_FALSE(zpack::decompressString(out, c.bytes, 50000)) << c.what;
        EXPECT_TRUE(out.empty()) << c.what;
    }
}

TEST(ZpackBadInput, LyingExpectedLengthCostsNothingButTime) {
    const std::string text = chartLikeText(300000);
    const std::string packed = compressed(text);
    for (unsigned long claim : {0UL, 1UL, 1000UL, 299999UL, 300001UL, 1UL << 40, ULONG_MAX}) {
        std::string out;
        ASSERT_TRUE(zpack::decompressString(out, packed, claim)) << claim;
        EXPECT_EQ(out, text) << claim;
    }
}

TEST_F(ZpackLimit, DefaultAndSetter) {
    EXPECT_EQ(zpack::decompressionLimit(), zpack::kDefaultDecompressionLimit);
    EXPECT_EQ(zpack::kDefaultDecompressionLimit, std::size_t(1) << 30);
    zpack::setDecompressionLimit(12345);
    EXPECT_EQ(zpack::decompressionLimit(), 12345u);
}

TEST_F(ZpackLimit, OutputUpToTheCapExactly) {
    const std::string text = randomBytes(1000, 3);
    const std::string packed = compressed(text);
    std::string out;
    zpack::setDecompressionLimit(1000);
    ASSERT_TRUE(zpack::decompressString(out, packed));
    EXPECT_EQ(out, text);
    ASSERT_TRUE(zpack::decompressString(out, packed, 1000));
    EXPECT_EQ(out, text);

    zpack::setDecompressionLimit(999);
    EXPECT_FALSE(zpack::decompressString(out, packed));
    EXPECT_TRUE(out.empty());
    EXPECT_FALSE(zpack::decompressString(out, packed, 1000));
    EXPECT_TRUE(out.empty());
    // A small cap below any buffer size the wrapper might start with.
    zpack::setDecompressionLimit(10);
    EXPECT_FALSE(zpack::decompressString(out, compressed("eleven char")));
    ASSERT_TRUE(zpack::decompressString(out, compressed("ten chars!")));
    EXPECT_EQ(out, "ten chars!");

    zpack::setDecompressionLimit(0);
    ASSERT_TRUE(zpack::decompressString(out, compressed("")));
    EXPECT_TRUE(out.empty());
    EXPECT_FALSE(zpack::decompressString(out, compressed("x")));
}

TEST_F(ZpackLimit, CapAppliesPastTheDirectlyWrittenPart) {
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
}

TEST(ZpackBomb, TenGibibytesOfZerosFailWithLittleMemory) {
    const std::string bomb = zeroStream(std::uint64_t(10) << 10);
    ASSERT_LT(bomb.size(), std::size_t(32) << 20);
    std::string out = "previous content";
    bool ok = true;
    const long growthKiB = peakGrowthKiB([&] { ok = zpack::decompressString(out, bomb); });
    EXPECT_FALSE(ok);
    EXPECT_TRUE(out.empty());
    RecordProperty("peak_growth_kib", static_cast<int>(growthKiB));
    if (growthKiB >= 0) {
        EXPECT_LT(growthKiB, 256L << 10) << "peak resident size grew by " << growthKiB << " KiB";
    }

    ok = true;
    EXPECT_FALSE(zpack::decompressString(out, bomb, 10UL << 30));
    EXPECT_TRUE(out.empty());
}

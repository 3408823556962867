// Bytes as a compressed text: decompression must fail cleanly (false, empty output) or give a
// text that compresses and decompresses back to itself, never crash and never exceed the cap.
#include <zpack/zpack.h>

#include <cstddef>
#include <cstdint>
#include <string>

namespace {
// Small enough that a fuzzer-made bomb costs little time, large enough for every seed.
constexpr std::size_t kLimit = std::size_t(4) << 20;
} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    zpack::setDecompressionLimit(kLimit);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string compressed(reinterpret_cast<const char*>(data), size);
    std::string text = "stale";
    const bool ok = zpack::decompressString(text, compressed);
    if (!ok && !text.empty())
        __builtin_trap();
    if (ok && text.size() > kLimit)
        __builtin_trap();

    // The hinted form must agree with the plain one whatever the hint says.
    const unsigned long hint =
        size >= 4 ? static_cast<unsigned long>(data[size - 1]) << 16 | static_cast<unsigned long>(data[0])
                  : 0;
    std::string hinted = "stale";
    if (zpack::decompressString(hinted, compressed, hint) != ok || hinted != (ok ? text : std::string()))
        __builtin_trap();

    if (ok) {
        std::string again;
        std::string back;
        if (!zpack::compressString(text, again) || static_cast<unsigned char>(again[0]) != 0x78 ||
            !zpack::decompressString(back, again) || back != text)
            __builtin_trap();
    }
    return 0;
}

#ifndef ZPACK_ZPACK_H
#define ZPACK_ZPACK_H

#include <cstddef>
#include <string>

// Compressed texts are zlib streams (RFC 1950) whose first byte is 0x78; std::string is only the
// container, so any bytes go in and come out. A false result leaves the output empty.
namespace zpack {

bool compressString(const std::string& input, std::string& output);

bool decompressString(std::string& output, const std::string& compressed);

// expectedLength sizes the output buffer; it is a hint, so a wrong one costs nothing but time.
bool decompressString(std::string& output, const std::string& compressed, unsigned long expectedLength);

// Decompression refuses to produce more than this many bytes (1 GiB unless the host says otherwise);
// exactly the limit is fine. Output beyond 64 MiB is measured before it is allocated, so a stream
// that would exceed the cap is refused without holding the cap's worth of memory. Process-wide.
constexpr std::size_t kDefaultDecompressionLimit = std::size_t(1) << 30;
void setDecompressionLimit(std::size_t bytes);
std::size_t decompressionLimit();

} // namespace zpack

#endif

#ifndef KOVAR_KOVARWIN_H
#define KOVAR_KOVARWIN_H

#include <cstddef>
#include <cstdint>

// The host's common system settings block, read by byte offset as the host lays it out. The
// stand-in keeps one process-wide block with the host's defaults; the host (and tests) change it
// through the setters.
namespace kovar {

constexpr std::size_t kCmnSysSize = 1024;
constexpr std::size_t kCmnSysDigitGrouping = 624;    // 64-bit, nonzero: plain numbers group digits
constexpr std::size_t kCmnSysMinIntegerDigits = 736; // unsigned 32-bit

// The block, kCmnSysSize bytes, aligned for 64-bit reads.
void* pvGetCmnSys();

void setDigitGrouping(bool on);            // default off
void setMinIntegerDigits(std::uint32_t n); // default 1
void resetCmnSys();

} // namespace kovar

#endif

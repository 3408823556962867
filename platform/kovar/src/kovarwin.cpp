#include <kovar/kovarwin.h>

#include <cstring>

namespace kovar {

namespace {

alignas(8) unsigned char block[kCmnSysSize];

bool initialise() {
    resetCmnSys();
    return true;
}

unsigned char* cmnSys() {
    static const bool ready = initialise();
    (void)ready;
    return block;
}

} // namespace

void* pvGetCmnSys() {
    return cmnSys();
}

void setDigitGrouping(bool on) {
    const std::uint64_t v = on ? 1 : 0;
    std::memcpy(cmnSys() + kCmnSysDigitGrouping, &v, sizeof v);
}

void setMinIntegerDigits(std::uint32_t n) {
    std::memcpy(cmnSys() + kCmnSysMinIntegerDigits, &n, sizeof n);
}

void resetCmnSys() {
    std::memset(block, 0, sizeof block);
    const std::uint32_t one = 1;
    std::memcpy(block + kCmnSysMinIntegerDigits, &one, sizeof one);
}

} // namespace kovar

#include <plotaid/TimeStamp.h>

#include <chrono>
#include <cstdint>
#include <cstdio>
#include <ctime>
#include <utility>

namespace {

struct ClockReading {
    std::time_t seconds;
    unsigned millis;  // 0..999
    std::uint32_t ms; // seconds * 1000 + millis, modulo 2^32
};

ClockReading readClock() {
    using namespace std::chrono;
    const auto sinceEpoch = duration_cast<milliseconds>(system_clock::now().time_since_epoch()).count();
    ClockReading r;
    r.seconds = static_cast<std::time_t>(sinceEpoch / 1000);
    r.millis = static_cast<unsigned>(sinceEpoch % 1000);
    r.ms = static_cast<std::uint32_t>(static_cast<std::uint64_t>(sinceEpoch));
    return r;
}

} // namespace

TimeStamp::TimeStamp(std::string prefix, unsigned fileNum) : prefix_(std::move(prefix)) {
    setFileNum(fileNum);
}

void TimeStamp::setFileNum(unsigned fileNum) {
    fileNum_ = fileNum;
    start_ = last_ = readClock().ms;
}

std::string TimeStamp::fileName() const {
    char number[16];
    std::snprintf(number, sizeof number, "%02u", fileNum_);
    return prefix_ + number + ".txt";
}

void TimeStamp::logTime(const std::string& tag, const std::string& text) {
    const ClockReading now = readClock();
    // Unsigned differences stay right across the 2^32 wrap of the millisecond clock.
    const std::uint32_t sinceLast = now.ms - last_;
    last_ = now.ms;
    const std::uint32_t sinceStart = now.ms - start_;

    char wall[16] = "00:00:00";
    std::tm local{};
    if (localtime_r(&now.seconds, &local))
        std::strftime(wall, sizeof wall, "%H:%M:%S", &local);

    std::FILE* log = std::fopen(fileName().c_str(), "a");
    if (!log)
        return;
    // Tag and text go out byte for byte, embedded NULs included.
    std::fwrite(tag.data(), 1, tag.size(), log);
    std::fprintf(log, " time = %s.%03u elapsed seconds = %3u.%03u total elapsed seconds = %3u.%03u ", wall,
                 now.millis, static_cast<unsigned>(sinceLast / 1000), static_cast<unsigned>(sinceLast % 1000),
                 static_cast<unsigned>(sinceStart / 1000), static_cast<unsigned>(sinceStart % 1000));
    std::fwrite(text.data(), 1, text.size(), log);
    std::fputc('\n', log);
    std::fflush(log);
    std::fclose(log);
}

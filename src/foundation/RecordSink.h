#ifndef PLOTAID_FOUNDATION_RECORDSINK_H
#define PLOTAID_FOUNDATION_RECORDSINK_H

#include <string>
#include <vector>

namespace plotaid::detail {

// One record of the error log as ChartErrorHandler wrote it (or would have, with no log set up).
struct LogRecord {
    std::string kind; // "Error -- ChartXML:", "Warning -- SAX Parser:", ...
    std::string message;
    bool isError() const { return kind.compare(0, 7, "Warning") != 0; }
};

// Collects the records reported on this thread while it lives, also when no error log is
// switched on, so a caller can tell what one operation reported without reading the log back.
// Collectors nest: the innermost one receives, and hands each record on to the one it replaced.
class RecordCollector {
public:
    RecordCollector() noexcept;
    ~RecordCollector();
    RecordCollector(const RecordCollector&) = delete;
    RecordCollector& operator=(const RecordCollector&) = delete;

    const std::vector<LogRecord>& records() const noexcept { return records_; }

    // Called by ChartErrorHandler for every record; costs nothing but a test when none listens.
    static void deliver(const char* kind, const std::string& message) noexcept;

private:
    // Bounds what a runaway reporter can make a collector hold.
    static constexpr std::size_t kMaxRecords = 1000;
    std::vector<LogRecord> records_;
    RecordCollector* outer_;
};

} // namespace plotaid::detail

#endif

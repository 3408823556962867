#ifndef PLOTAID_TIMESTAMP_H
#define PLOTAID_TIMESTAMP_H

#include <plotaid/Export.h>

#include <string>

// Appends timing lines to a text log: wall-clock time, time since the previous line and time
// since the start. The log file is the prefix, the file number in at least two digits, ".txt".
class PLOTAID_API TimeStamp {
public:
    TimeStamp(std::string prefix, unsigned fileNum);

    // Restarts both the start and the previous-line clocks.
    void setFileNum(unsigned fileNum);
    // A file that cannot be opened loses the line silently.
    void logTime(const std::string& tag, const std::string& text);

    std::string fileName() const;

private:
    unsigned start_ = 0;
    unsigned last_ = 0;
    std::string prefix_;
    unsigned fileNum_ = 0;
};

#endif

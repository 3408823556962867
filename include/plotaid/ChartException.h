#ifndef PLOTAID_CHARTEXCEPTION_H
#define PLOTAID_CHARTEXCEPTION_H

#include <plotaid/Export.h>

#include <cstdint>
#include <exception>
#include <string>

// The one exception type of the library: a message, the source-file text of the place that raised
// it, and a line number. Reported through ChartErrorHandler; rarely thrown.
class PLOTAID_API ChartException : public std::exception {
public:
    ChartException() = default;
    ChartException(std::string message, std::string file, std::uint32_t line);
    ChartException(const ChartException&) = default;
    ChartException& operator=(const ChartException&) = default;
    ~ChartException() override;

    const char* what() const noexcept override;
    virtual const char* file() const noexcept;
    virtual std::uint32_t line() const noexcept;

private:
    std::string message_;
    std::string file_;
    std::uint32_t line_ = 0;
};

#endif

#include <plotaid/ChartException.h>

#include <utility>

ChartException::ChartException(std::string message, std::string file, std::uint32_t line)
    : message_(std::move(message)), file_(std::move(file)), line_(line) {}

ChartException::~ChartException() = default;

const char* ChartException::what() const noexcept { return message_.c_str(); }
const char* ChartException::file() const noexcept { return file_.c_str(); }
std::uint32_t ChartException::line() const noexcept { return line_; }

#ifndef PLOTAID_FOUNDATION_REPORT_H
#define PLOTAID_FOUNDATION_REPORT_H

#include <string>
#include <utility>

namespace plotaid::detail {

// The record a host-facing operation writes when it fails: an error naming the source-file text and
// line that the error log has always shown for it. Never throws.
void reportFailure(const std::string& message, const char* file, unsigned line) noexcept;

// Runs body; whatever it throws becomes the failure record and the fallback value, so no exception
// reaches the host through this operation.
template <class T, class Body>
T guarded(const char* file, unsigned line, const char* message, T fallback, Body&& body) noexcept {
    try {
        return std::forward<Body>(body)();
    } catch (...) {
        reportFailure(message, file, line);
        return fallback;
    }
}

template <class Body>
void guarded(const char* file, unsigned line, const char* message, Body&& body) noexcept {
    try {
        std::forward<Body>(body)();
    } catch (...) {
        reportFailure(message, file, line);
    }
}

} // namespace plotaid::detail

#endif

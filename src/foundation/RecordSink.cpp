#include "foundation/RecordSink.h"

namespace plotaid::detail {

namespace {
thread_local RecordCollector* current = nullptr;
} // namespace

RecordCollector::RecordCollector() noexcept : outer_(current) {
    current = this;
}

RecordCollector::~RecordCollector() {
    current = outer_;
}

void RecordCollector::deliver(const char* kind, const std::string& message) noexcept {
    for (RecordCollector* c = current; c != nullptr; c = c->outer_) {
        if (c->records_.size() >= kMaxRecords)
            continue;
        try {
            c->records_.push_back(LogRecord{kind ? kind : "", message});
        } catch (...) {
            // A record that cannot be kept is dropped; reporting never fails the reporter.
        }
    }
}

} // namespace plotaid::detail

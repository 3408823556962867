#ifndef PLOTAID_FOUNDATION_XERCESRUNTIME_H
#define PLOTAID_FOUNDATION_XERCESRUNTIME_H

namespace plotaid::detail {

// One reference to the process-wide Xerces-C runtime. The first reference initialises Xerces-C,
// the last one terminates it, so anything that owns Xerces objects (a parser, a document) holds one
// for as long as those objects live. A failed initialisation is reported to the error log, not
// thrown; ready() then says false and the holder must not touch Xerces. After a failure no later
// attempt is made: Xerces-C cannot be trusted in a half-initialised state.
class XercesRuntime {
public:
    XercesRuntime() noexcept;
    // A copy is one more reference.
    XercesRuntime(const XercesRuntime& other) noexcept;
    // Both sides already hold a reference; nothing changes hands.
    XercesRuntime& operator=(const XercesRuntime&) noexcept { return *this; }
    ~XercesRuntime();

    bool ready() const noexcept { return ready_; }

    // How many references the process holds now.
    static unsigned references() noexcept;

    // Has `drop` run just before the last reference terminates Xerces-C, for caches of Xerces
    // objects, which must not outlive it. It runs under the runtime's lock: it must not take a
    // reference itself. Registering the same function again changes nothing.
    static void beforeTermination(void (*drop)()) noexcept;

private:
    bool ready_;
};

} // namespace plotaid::detail

#endif

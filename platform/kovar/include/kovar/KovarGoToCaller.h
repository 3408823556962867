#ifndef KOVAR_KOVARGOTOCALLER_H
#define KOVAR_KOVARGOTOCALLER_H

// The host's exception for unwinding straight back to its caller. The library never throws it and
// lets it pass through untouched wherever it may meet one (a host callback inside a template
// application).
class KovarGoToCaller {
public:
    KovarGoToCaller() = default;
    explicit KovarGoToCaller(int code) : code_(code) {}
    int code() const noexcept { return code_; }

private:
    int code_ = 0;
};

#endif

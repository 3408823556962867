#ifndef GRX_EXPORT_H
#define GRX_EXPORT_H

// The object model is built with hidden symbols; its public classes carry this macro.
#if defined(__GNUC__) || defined(__clang__)
#define GRX_API __attribute__((visibility("default")))
#else
#define GRX_API
#endif

#endif

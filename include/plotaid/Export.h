#ifndef PLOTAID_EXPORT_H
#define PLOTAID_EXPORT_H

// The library is built with hidden symbols; exported classes carry this one macro.
#if defined(__GNUC__) || defined(__clang__)
#define PLOTAID_API __attribute__((visibility("default")))
#else
#define PLOTAID_API
#endif

#endif

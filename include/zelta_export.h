// What the library exports: the library is built with hidden visibility, and
// only what this macro marks, the classes and functions of these headers,
// is seen from outside it. ZELTA_LOCAL hides the library's own classes that
// are nested in exported ones.
#ifndef ZELTA_EXPORT_H
#define ZELTA_EXPORT_H

#if defined(__GNUC__)
#define ZELTA_EXPORT __attribute__((visibility("default")))
#define ZELTA_LOCAL __attribute__((visibility("hidden")))
#else
#define ZELTA_EXPORT
#define ZELTA_LOCAL
#endif

#endif

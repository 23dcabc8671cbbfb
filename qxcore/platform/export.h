// The export macro: marks what a client may link to.
#pragma once

#if defined(_WIN32) && !defined(UNICODE)
#error "qxcore is built for Unicode: define UNICODE (and _UNICODE) for everything that includes its headers"
#endif

// Marks what the library exports.
#ifdef _WIN32
#ifdef QXCORE_BUILDING
#define QXCORE_API __declspec(dllexport)
#else
#define QXCORE_API __declspec(dllimport)
#endif
#else
#define QXCORE_API __attribute__((visibility("default")))
#endif

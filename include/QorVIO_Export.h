// QORVIO_API marks the exported interface; everything else of the library is hidden.
#pragma once

#if defined(_WIN32) && defined(QORVIO_BUILDING)
#define QORVIO_API __declspec(dllexport)
#elif defined(_WIN32)
#define QORVIO_API __declspec(dllimport)
#else
#define QORVIO_API __attribute__((visibility("default")))
#endif

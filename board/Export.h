// QORBOARD_API marks the exported interface; everything else of the library is hidden.
#pragma once

#if defined(_WIN32) && defined(QORBOARD_BUILDING)
#define QORBOARD_API __declspec(dllexport)
#elif defined(_WIN32)
#define QORBOARD_API __declspec(dllimport)
#else
#define QORBOARD_API __attribute__((visibility("default")))
#endif

// QOR_API marks what a platform library shows to its users; everything else is hidden.
#pragma once

#if defined(_WIN32) && defined(QOR_BUILDING_SIBLING)
#define QOR_API __declspec(dllexport)
#elif defined(_WIN32)
#define QOR_API __declspec(dllimport)
#else
#define QOR_API __attribute__((visibility("default")))
#endif

// This process, for others to know it by.
#pragma once

#include <cstdint>
#include <string>

namespace os {

/// The number of this process.
unsigned long processId();

/// The name that it was started by, without its folder.
std::string programName();

/// Seconds since 1970.
std::int64_t now();

/// Such a time as people here write it: "2026-11-23 18:03:05".
std::string localTime(std::int64_t seconds);

}  // namespace os

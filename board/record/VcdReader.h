/// @file
/// Value change dumps, as recordings and simulators write them, read back.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "board/Export.h"

namespace qor {

struct VcdChange {
  std::uint64_t time;  ///< in steps of the dump
  std::string
      value;  ///< 0, 1, x and z, most significant first, at most as many as the width; or a real number
};

struct VcdVariable {
  std::string name;
  unsigned width;      ///< in bits
  std::size_t signal;  ///< which of the dump's signals; several variables may name one
};

struct VcdDump {
  double stepSeconds = 1e-9;
  std::uint64_t begin = 0;  ///< the first and the last time stamp
  std::uint64_t end = 0;
  std::vector<VcdVariable> variables;
  std::vector<std::vector<VcdChange>> signals;  ///< in the order of their times
};

/// Reads a file of at most 1 GiB, with times below 2^53 and variables of at most 1048576 bits. Throws WrongUse when it
/// cannot be read, and "FILE:LINE: what is wrong" where it is no value change dump.
QORBOARD_API VcdDump readVcd(const std::string& path);

}  // namespace qor

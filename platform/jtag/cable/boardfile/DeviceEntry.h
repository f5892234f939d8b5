// What a board file says of one device of the chain.
#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>

#include "Qor_Cable.h"

namespace QorRT {

/// The opcodes of USER1 to USER4.
using UserOpcodes = std::array<std::uint64_t, Qor_Cable::userChainCount>;

/// The opcode of a user register that a device does not have: all ones, which select BYPASS.
constexpr std::uint64_t noOpcode = ~std::uint64_t{0};

/// Nothing, for what is to be found out.
struct DeviceEntry {
  std::optional<unsigned> idcode;
  std::optional<unsigned> irLength;
  std::optional<UserOpcodes> userOpcodes;
  std::string name;
  std::string tap;  ///< what a JTAG server calls it
};

}  // namespace QorRT

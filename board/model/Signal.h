/// @file
/// A named row of port bits, and how its values are shown and given.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "QorVIO_Records.h"
#include "board/Export.h"

namespace qor {

/// The numbers are the library's port type codes.
enum class Port : unsigned { syncOut, syncIn, asyncOut, asyncIn };

constexpr bool isInput(Port port) {
  return port == Port::syncIn || port == Port::asyncIn;
}
constexpr bool isSync(Port port) {
  return port == Port::syncIn || port == Port::syncOut;
}

/// "async_in" and so on, as files and tables spell it.
QORBOARD_API const char* portName(Port port);

/// The library's name for the whole port: "async_in_data" and so on.
QORBOARD_API const char* wholePortName(Port port);

/// Width of a port in bits.
QORBOARD_API unsigned widthOf(const QORVIO_CORE_INFO& info, Port port);

/// Of signals of the radix signedDec the top bit is the sign.
enum class Radix { hex, bin, dec, signedDec };

/// "hex", "bin", "dec" or "signed".
QORBOARD_API const char* radixName(Radix radix);
/// Throws WrongUse.
QORBOARD_API Radix radixNamed(std::string_view text);

/// A synchronous output plays so many steps, one per clock of the design.
constexpr unsigned stepCount = 16;

struct Signal {
  std::string name;
  Port port = Port::asyncIn;
  std::vector<unsigned> bits{};  ///< element i is the port bit that carries bit i of the value
  Radix radix = Radix::hex;
  std::vector<std::pair<std::string, std::uint64_t>> names{};  ///< enumerated values
  double scale = 0;                                            ///< what one step is worth; 0 without a scale
  std::string unit{};
  std::string description{};
  std::size_t core = 0;  ///< which of the cores of its table

  unsigned width() const { return static_cast<unsigned>(bits.size()); }
};

/// The bits as signals files have them, most significant first: "5", "7:4", "0:3", or "5,2,0".
QORBOARD_API std::string bitsText(const std::vector<unsigned>& bits);

}  // namespace qor

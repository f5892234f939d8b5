// A named row of port bits, and how its values are shown and given.
#pragma once

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

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
const char* portName(Port port);

/// The library's name for the whole port: "async_in_data" and so on.
const char* wholePortName(Port port);

enum class Radix { hex, bin, dec, signedDec };

struct Signal {
  std::string name;
  Port port = Port::asyncIn;
  std::vector<unsigned> bits{};  ///< element i is the port bit that carries bit i of the value
  Radix radix = Radix::hex;
  std::vector<std::pair<std::string, std::uint64_t>> names{};  ///< enumerated values
  double scale = 0;                                            ///< what one step is worth; 0 without a scale
  std::string unit{};
  std::string description{};

  unsigned width() const { return static_cast<unsigned>(bits.size()); }
};

/// The bits as people write them: "5", "7:4", "0:3", or "0,2,5".
std::string bitsText(const std::vector<unsigned>& bits);

}  // namespace qor

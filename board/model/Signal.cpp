#include "board/model/Signal.h"

namespace qor {
namespace {

constexpr const char* portNames[] = {"sync_out", "sync_in", "async_out", "async_in"};
constexpr const char* wholePortNames[] = {"sync_out_data", "sync_in_data", "async_out_data", "async_in_data"};

// 1 or -1 when each bit follows the one before at that distance, else 0.
int direction(const std::vector<unsigned>& bits) {
  if (bits.size() < 2) return 0;
  const int step = bits[1] > bits[0] ? 1 : -1;
  for (std::size_t i = 1; i < bits.size(); ++i)
    if (static_cast<long>(bits[i]) - static_cast<long>(bits[i - 1]) != step) return 0;
  return step;
}

}  // namespace

const char* portName(Port port) {
  return portNames[static_cast<unsigned>(port)];
}

const char* wholePortName(Port port) {
  return wholePortNames[static_cast<unsigned>(port)];
}

std::string bitsText(const std::vector<unsigned>& bits) {
  if (direction(bits) != 0) return std::to_string(bits.back()) + ":" + std::to_string(bits.front());
  std::string text;
  for (unsigned bit : bits) text.append(text.empty() ? "" : ",").append(std::to_string(bit));
  return text;
}

}  // namespace qor

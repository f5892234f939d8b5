#include "board/model/Signal.h"

#include "board/model/Errors.h"

namespace qor {
namespace {

constexpr const char* portNames[] = {"sync_out", "sync_in", "async_out", "async_in"};
constexpr const char* wholePortNames[] = {"sync_out_data", "sync_in_data", "async_out_data", "async_in_data"};

constexpr std::pair<const char*, Radix> radixes[] = {
    {"hex", Radix::hex}, {"bin", Radix::bin}, {"dec", Radix::dec}, {"signed", Radix::signedDec}};

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

unsigned widthOf(const QORVIO_CORE_INFO& info, Port port) {
  switch (port) {
    case Port::syncOut:
      return info.sync_output_count;
    case Port::syncIn:
      return info.sync_input_count;
    case Port::asyncOut:
      return info.async_output_count;
    case Port::asyncIn:
      break;
  }
  return info.async_input_count;
}

const char* radixName(Radix radix) {
  return radixes[static_cast<unsigned>(radix)].first;
}

Radix radixNamed(std::string_view text) {
  for (const auto& [name, radix] : radixes)
    if (name == text) return radix;
  throw WrongUse("not a radix (hex, bin, dec, signed): " + std::string(text));
}

std::string bitsText(const std::vector<unsigned>& bits) {
  if (direction(bits) != 0) return std::to_string(bits.back()) + ":" + std::to_string(bits.front());
  std::string text;
  for (auto bit = bits.rbegin(); bit != bits.rend(); ++bit)
    text.append(text.empty() ? "" : ",").append(std::to_string(*bit));
  return text;
}

}  // namespace qor

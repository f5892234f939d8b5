#include "bench/PlainPorts.h"

#include <cstddef>

namespace bench {

namespace {

bool bitOf(const unsigned char* bytes, std::size_t bit) {
  return ((bytes[bit / 8] >> (bit % 8)) & 1) != 0;
}

std::string hexOf(const std::string& digits) {
  std::string hex;
  std::string padded = std::string((4 - digits.size() % 4) % 4, '0') + digits;
  for (std::size_t i = 0; i < padded.size(); i += 4) {
    int value = 0;
    for (std::size_t k = 0; k < 4; ++k) value = value * 2 + (padded[i + k] - '0');
    hex += "0123456789ABCDEF"[value];
  }
  return hex;
}

}  // namespace

PlainPorts::PlainPorts(unsigned width)
    : width_(width),
      asyncOut_(width, '0'),
      trains_(width, std::string(16, '0')),
      mask_(width, '1'),
      inputs_(8, mask_) {}

std::string PlainPorts::write(const unsigned char* asyncBits, const unsigned char* syncStepBits) {
  const std::size_t planeBytes = (std::size_t{width_} + 7) / 8;
  for (std::size_t i = 0; i < width_; ++i) asyncOut_[i] = bitOf(asyncBits, i) ? '1' : '0';
  for (std::size_t step = 0; step < 16; ++step)
    for (std::size_t i = 0; i < width_; ++i)
      trains_[i][step] = bitOf(syncStepBits + step * planeBytes, i) ? '1' : '0';
  std::string digits = asyncOut_;
  for (const std::string& train : trains_) digits += train;
  return hexOf(digits + mask_ + mask_);
}

void PlainPorts::read(const std::vector<unsigned char>& result,
                      std::vector<std::vector<unsigned char>>& ports) {
  const std::size_t count = std::size_t{10} * width_;
  std::string digits;
  for (std::size_t k = 0; k < count; ++k) digits += bitOf(result.data(), count - 1 - k) ? '1' : '0';
  for (std::size_t i = 0; i < width_; ++i) {
    for (std::size_t kind = 0; kind < 3; ++kind) inputs_[kind][i] = digits[4 * i + kind];
    for (std::size_t kind = 0; kind < 5; ++kind)
      inputs_[3 + kind][i] = digits[4 * std::size_t{width_} + 6 * i + kind];
  }
  for (std::size_t port = 0; port < ports.size(); ++port) {
    for (std::size_t i = 0; i < width_; ++i) {
      const auto bit = static_cast<unsigned char>(1U << (i % 8));
      unsigned char& byte = ports[port][i / 8];
      byte = static_cast<unsigned char>(inputs_[port][i] == '1' ? byte | bit : byte & ~bit);
    }
  }
}

}  // namespace bench

#include "platform/core/Qor_Crc.h"

#include <array>
#include <cstdint>

namespace QorRT {
namespace {

constexpr unsigned polynomial = 0x8408;

constexpr unsigned shiftOnce(unsigned crc) {
  return crc >> 1 ^ ((crc & 1) != 0 ? polynomial : 0);
}

/// Entry [n][b]: what byte b contributes when n further bytes follow it.
using Tables = std::array<std::array<std::uint16_t, 256>, 8>;

constexpr Tables makeTables() {
  Tables tables{};
  for (unsigned byte = 0; byte < 256; ++byte) {
    unsigned crc = byte;
    for (int bit = 0; bit < 8; ++bit) crc = shiftOnce(crc);
    tables[0][byte] = static_cast<std::uint16_t>(crc);
  }
  for (unsigned n = 1; n < 8; ++n) {
    for (unsigned byte = 0; byte < 256; ++byte) {
      const unsigned crc = tables[n - 1][byte];
      tables[n][byte] = static_cast<std::uint16_t>(crc >> 8 ^ tables[0][crc & 0xFF]);
    }
  }
  return tables;
}

constexpr Tables tables = makeTables();

}  // namespace

unsigned crc16(const unsigned char* bytes, std::size_t bitCount) noexcept {
  unsigned crc = 0xFFFF;
  std::size_t left = bitCount;
  // Eight bytes a step: their table look-ups do not wait for each other, as those of single bytes do.
  for (; left >= 64; left -= 64, bytes += 8) {
    crc = tables[7][bytes[0] ^ (crc & 0xFF)] ^ tables[6][bytes[1] ^ crc >> 8] ^ tables[5][bytes[2]] ^
          tables[4][bytes[3]] ^ tables[3][bytes[4]] ^ tables[2][bytes[5]] ^ tables[1][bytes[6]] ^
          tables[0][bytes[7]];
  }
  for (; left >= 8; left -= 8, ++bytes) crc = crc >> 8 ^ tables[0][(crc ^ *bytes) & 0xFF];
  for (unsigned bit = 0; bit < left; ++bit) crc = shiftOnce(crc ^ (*bytes >> bit & 1U));
  return crc ^ 0xFFFF;
}

}  // namespace QorRT

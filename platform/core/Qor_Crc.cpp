#include "platform/core/Qor_Crc.h"

#include <array>

namespace QorRT {
namespace {

constexpr std::uint32_t polynomial = 0xEDB88320;

constexpr std::uint32_t shiftOnce(std::uint32_t crc) {
  return crc >> 1 ^ ((crc & 1) != 0 ? polynomial : 0);
}

/// Entry [n][b]: what byte b contributes when n further bytes follow it.
using Tables = std::array<std::array<std::uint32_t, 256>, 8>;

constexpr Tables makeTables() {
  Tables tables{};
  for (unsigned byte = 0; byte < 256; ++byte) {
    std::uint32_t crc = byte;
    for (int bit = 0; bit < 8; ++bit) crc = shiftOnce(crc);
    tables[0][byte] = crc;
  }
  for (unsigned n = 1; n < 8; ++n) {
    for (unsigned byte = 0; byte < 256; ++byte) {
      const std::uint32_t crc = tables[n - 1][byte];
      tables[n][byte] = crc >> 8 ^ tables[0][crc & 0xFF];
    }
  }
  return tables;
}

constexpr Tables tables = makeTables();

}  // namespace

void Qor_Crc32::add(const unsigned char* bytes, std::size_t bitCount) noexcept {
  std::uint32_t crc = register_;
  std::size_t left = bitCount;
  // Eight bytes per step: their table look-ups do not wait for each other, as those of single bytes do.
  for (; left >= 64; left -= 64, bytes += 8) {
    crc = tables[7][bytes[0] ^ (crc & 0xFF)] ^ tables[6][bytes[1] ^ (crc >> 8 & 0xFF)] ^
          tables[5][bytes[2] ^ (crc >> 16 & 0xFF)] ^ tables[4][bytes[3] ^ crc >> 24] ^ tables[3][bytes[4]] ^
          tables[2][bytes[5]] ^ tables[1][bytes[6]] ^ tables[0][bytes[7]];
  }
  for (; left >= 8; left -= 8, ++bytes) crc = crc >> 8 ^ tables[0][(crc ^ *bytes) & 0xFF];
  for (unsigned bit = 0; bit < left; ++bit) crc = shiftOnce(crc ^ (*bytes >> bit & 1U));
  register_ = crc;
}

}  // namespace QorRT

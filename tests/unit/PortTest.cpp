// Whole ports as raw bits. Narrow ones, masks, counts and buffers left out: tests/fuzz/corpus/ports.
#include "tests/unit/VioTest.h"

namespace {

using Bytes = std::vector<unsigned char>;

TEST_F(VioTest, TheWidestPortsAreSentWhole) {
  constexpr unsigned width = 65535;
  initCore(0, 0, width, width);
  Bytes values((width + 7) / 8);
  Bytes planes(16 * values.size());
  for (std::size_t i = 0; i < values.size(); ++i) values[i] = static_cast<unsigned char>(i * 7 + 1);
  for (std::size_t i = 0; i < planes.size(); ++i) planes[i] = static_cast<unsigned char>(i * 11 + (i >> 8));
  const unsigned char* bits = values.data();
  EXPECT_EQ(QorVIO_setPortBits(session, ref, bits, bits, width, planes.data(), bits, width), 0U);
  auto bit = [](const Bytes& bytes, std::size_t i) { return (bytes[i / 8] >> (i % 8)) & 1 ? '1' : '0'; };
  std::string port, trains;
  for (std::size_t i = 0; i < width; ++i) {
    port += bit(values, i);
    for (std::size_t s = 0; s < 16; ++s) trains += bit(planes, 8 * values.size() * s + i);
  }
  EXPECT_TRUE(writtenDigits(19 * width) == port + trains + port + port);
}

}  // namespace

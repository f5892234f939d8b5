// Whole ports as raw bits.
#include "tests/unit/VioTest.h"

namespace {

using Bytes = std::vector<unsigned char>;

TEST_F(VioTest, APortWithoutACountKeepsItsValuesAndIsNotAddressed) {
  initCore(0, 0, 3, 10);
  const Bytes values{0x05}, others{0x02}, mask{0x04}, all(2, 0xFF);
  Bytes planes(32);
  planes[2 * 3 + 1] = 0x02;  // step 3 of bit 9
  const std::string trains = std::string(9 * 16, '0') + "0001000000000000", none(10, '0'), every(10, '1');
  const auto sent = [&](const Bytes* async, const Bytes& asyncMask, bool isSync) {
    EXPECT_EQ(QorVIO_setPortBits(session, ref, async != nullptr ? async->data() : nullptr, asyncMask.data(),
                                 async != nullptr ? 3 : 0, isSync ? planes.data() : nullptr, all.data(),
                                 isSync ? 10 : 0),
              0U);
    return writtenDigits(2 * 3 + 17 * 10);
  };
  EXPECT_EQ(sent(&values, mask, true), "101" + trains + "001" + every);
  EXPECT_EQ(sent(nullptr, mask, false), "101" + trains + "000" + none);
  EXPECT_EQ(sent(&others, all, false), "010" + trains + "111" + none);
}

TEST_F(VioTest, AReadFillsTheBuffersThatAreGivenUpToTheWidth) {
  constexpr unsigned async = 35, sync = 19;
  initCore(async, sync, 0, 0);
  for (unsigned k = 0; k < 4 * async + 6 * sync; ++k) platform.readDigits += k * k / 3 % 2 != 0 ? '1' : '0';
  Bytes b[8];
  for (bool isAsyncWanted : {false, true}) {
    for (Bytes& bytes : b) bytes.assign(5, 0xA5);
    EXPECT_EQ(
        QorVIO_getPortBits(session, ref, b[0].data(), b[1].data(), b[2].data(), isAsyncWanted ? async : 0,
                           b[3].data(), b[4].data(), b[5].data(), b[6].data(), b[7].data(), sync),
        0U);
    for (unsigned kind = 0; kind < 8; ++kind) {
      Bytes expected(5, 0xA5);
      const unsigned width = kind >= 3 ? sync : isAsyncWanted ? async : 0;
      for (unsigned i = 0; i < width; ++i) {
        const char digit = platform.readDigits[kind < 3 ? 4 * i + kind : 4 * async + 6 * i + kind - 3];
        const unsigned cleared = expected[i / 8] & ~(1U << i % 8);
        expected[i / 8] = static_cast<unsigned char>(cleared | (digit == '1' ? 1U << i % 8 : 0));
      }
      EXPECT_EQ(b[kind], expected) << kind;
    }
  }
}

}  // namespace

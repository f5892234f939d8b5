// Whole ports of every width, through the whole library and a simulated board.
#include <numeric>

#include "tests/system/Board.h"

namespace {

using qorsim::chain;
using qorsim::loopback;
using qorsim::vio;

TEST(WholePorts, GoRoundUnderTheirMaskAtEveryWidthAndPlaceOnTheChain) {
  for (auto [width, place] : {std::pair{1U, 0U}, {7U, 2U}, {8U, 0U}, {33U, 2U}, {4096U, 0U}, {65535U, 2U}}) {
    auto builder = chain();
    for (unsigned device = 0; device < place; ++device) builder.device(device).irLength(4 + device);
    builder.device(0x11).core(
        3, 9, vio().asyncOut(width).asyncIn(width).syncOut(width).syncIn(width).design(loopback()));
    builder.device().irLength(11);
    Board board(builder.cable());
    const QOR_CORE_REF ref{place, 3, 9};
    VioCore core(board, ref);
    const std::size_t bytes = (width + 7) / 8;
    Bytes values(bytes), steps(16 * bytes), mask(bytes, 0xFD), async(bytes), rose(bytes), sync(bytes);
    std::iota(values.begin(), values.end(), static_cast<unsigned char>(0x37));
    std::iota(steps.begin(), steps.end(), static_cast<unsigned char>(0x9E));
    unsigned char* none = nullptr;
    EXPECT_EQ(QorVIO_setPortBits(board.session, ref, values.data(), mask.data(), width, steps.data(),
                                 mask.data(), width),
              0U);
    EXPECT_EQ(QorVIO_getPortBits(board.session, ref, async.data(), rose.data(), none, width, sync.data(),
                                 none, none, none, none, width),
              0U);
    mask.back() &= static_cast<unsigned char>(0xFF >> (8 * bytes - width));
    for (std::size_t i = 0; i < bytes; ++i) {
      ASSERT_EQ(async[i], values[i] & mask[i]) << width << " bits, byte " << i;
      ASSERT_EQ(rose[i], async[i]) << width << " bits, byte " << i;
      ASSERT_EQ(sync[i], steps[15 * bytes + i] & mask[i]) << width << " bits, byte " << i;
    }
  }
}

}  // namespace

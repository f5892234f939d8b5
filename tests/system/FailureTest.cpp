// What goes wrong on a board or a link: one message that names it, and a session that goes on.
#include "tests/system/Board.h"

namespace {

using qorsim::chain;
using qorsim::vio;

constexpr QOR_CORE_REF first{0, 1, 0};

TEST(Sessions, ThatAreUnknownOrClosedFailEveryCall) {
  EXPECT_EQ(QorVIO_initCore(4000000000, first), failed);
  Board board("sim:");
  VioCore core(board, first);
  board.close();
  EXPECT_EQ(QorRT::Qor_CoreList::getCore(board.session, first), nullptr);
  testing::internal::CaptureStderr();  // with the session its handler is gone: the message goes where they go
                                       // by default
  TextMap map;
  TextMap* pointer = &map;
  EXPECT_EQ(QorVIO_readValues(board.session, first, &pointer), failed);
  EXPECT_EQ(QorVIO_terminateCore(board.session, first), 0U);
  std::string said = testing::internal::GetCapturedStderr();
  EXPECT_NE(said.find("session " + std::to_string(board.session) + " is closed"), std::string::npos) << said;
}

TEST(DesignClock, ThatStandsStillIsToldAndThatIsSlowPlaysAPulseOnce) {
  for (unsigned tcks : {0U, 50U}) {
    int pulses = 0;
    auto watch = [&](qorsim::Ports& ports) { pulses += ports.syncOut[0]; };
    const auto design = vio().syncOut(1).syncIn(1).design(qorsim::callback(watch));
    Board board(chain().device(0x11).core(1, 0, design).tcksPerClock(tcks).cable());
    VioCore core(board, first);
    pulses = 0;
    TextMap map{{"sync_out_data.pulsetrain", "0100"}};  // 1 at step 1 alone
    TextMap* pointer = &map;
    EXPECT_EQ(QorVIO_writeValues(board.session, first, &pointer), tcks == 0 ? failed : 0U);
    EXPECT_EQ(QorVIO_readValues(board.session, first, &pointer), tcks == 0 ? failed : 0U);
    const auto stopped = testing::StartsWith("100 device 0, user chain 1, core 0: design clock stopped, ");
    EXPECT_THAT(board.takeMessages(),
                testing::AllOf(testing::Each(stopped), testing::SizeIs(tcks == 0 ? 2 : 0)));
    QORVIO_CORE_INFO info{};
    EXPECT_EQ(QorVIO_getInfo(board.session, first, &info), 0U);  // status needs no design clock
    for (int i = 0; tcks != 0 && i < 100; ++i) core.write({});
    EXPECT_EQ(pulses, tcks == 0 ? 0 : 1);
  }
}

}  // namespace

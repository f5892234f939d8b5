// What goes wrong on a board or a link: one message that names it, and a session that goes on.
#include <stdexcept>

#include "Board.h"
#include "FaultyCable.h"

namespace {

using qorsim::chain;
using qorsim::loopback;
using qorsim::vio;

constexpr QOR_CORE_REF first{0, 1, 0};

std::string openingFails(const char* url) {
  try {
    QorJtag_session_close(QorJtag_session_open(url));
  } catch (const std::exception& e) {
    return e.what();
  }
  return "opened";
}

TEST(Addresses, ThatLeadNowhereSaySo) {
  Board board("sim:");
  const std::pair<QOR_CORE_REF, const char*> cases[] = {
      {{2, 1, 0}, "100 there is no device 2: the chain has 2 devices"},
      {{0, 5, 0}, "100 device 0 has no user chain 5: they are 1 to 4"},
      {{0, 2, 0}, "100 device 0, user chain 2, core 0: no debug hub answers, TDO is all zeros"},
      {{0, 1, 16}, "100 the core index 16 is above 15"},
  };
  for (const auto& [ref, message] : cases) {
    EXPECT_EQ(QorVIO_initCore(board.session, ref), failed);
    EXPECT_THAT(board.takeMessages(), ElementsAre(message));
  }
  for (QOR_CORE_REF ref : {QOR_CORE_REF{0, 1, 1}, {0, 1, 9}}) {
    EXPECT_EQ(QorVIO_initCore(board.session, ref), failed);
    EXPECT_THAT(board.takeMessages(),
                ElementsAre("100 QorVIO_initCore() for the wrong core type or non-existant core.",
                            "8000 Qor abort command"));
  }
}

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

TEST(Urls, ThatAreWrongOpenNothing) {
  EXPECT_EQ(openingFails("sim:"), "opened");
  const std::pair<const char*, const char*> cases[] = {
      {"", "the cable URL is empty"},
      {"sim", "the cable URL \"sim\" has no colon after its kind"},
      {"usb:1", "the cable URL \"usb:1\" is of the unknown kind \"usb\"; known: sim"},
      {"sim:no/such/board.toml", "no/such/board.toml: cannot be opened: No such file or directory"},
  };
  for (auto [url, message] : cases) EXPECT_EQ(openingFails(url), message);
}

TEST(DesignClock, ThatStandsStillIsToldAndThatIsSlowIsWaitedFor) {
  for (unsigned tcks : {0U, 100U}) {
    Board board(chain()
                    .device(0x11)
                    .core(1, 0, vio().asyncOut(4).syncOut(4).asyncIn(4).design(loopback()))
                    .tcksPerClock(tcks)
                    .cable());
    VioCore core(board, first);
    TextMap map{{"async_out_data", "5"}, {"sync_out_data", "5"}};
    TextMap* pointer = &map;
    EXPECT_EQ(QorVIO_writeValues(board.session, first, &pointer), tcks == 0 ? failed : 0U);
    EXPECT_EQ(QorVIO_readValues(board.session, first, &pointer), tcks == 0 ? failed : 0U);
    EXPECT_THAT(board.takeMessages(),
                testing::Each("100 device 0, user chain 1, core 0: design clock stopped"));
    EXPECT_EQ(map["async_in_data"], tcks == 0 ? "" : "5");
  }
}

TEST(PulseTrains, OnASlowDesignClockPlayOnce) {
  std::string seen;
  auto watch = [&](qorsim::Ports& ports) { seen += static_cast<char>('0' + ports.syncOut[0]); };
  Board board(chain()
                  .device(0x11)
                  .core(1, 0, vio().syncOut(1).design(qorsim::callback(watch)))
                  .tcksPerClock(50)
                  .cable());
  VioCore core(board, first);
  seen.clear();
  core.write({{"sync_out_data.pulsetrain", "0100"}});  // 1 at step 1 alone
  for (int i = 0; i < 100; ++i) core.write({});
  EXPECT_EQ(std::count(seen.begin(), seen.end(), '1'), 1) << seen;
}

TEST(Links, ThatAreCutFailEveryTransferAndGoOnAfterwards) {
  auto link = std::make_unique<qorsim::FaultyCable>(
      chain().device(0x11).core(1, 0, vio().asyncOut(4).asyncIn(4).design(loopback())).cable());
  qorsim::FaultyCable& cut = *link;
  Board board(std::move(link));
  VioCore core(board, first);
  core.write({{"async_out_data", "6"}});
  core.read();
  for (bool level : {false, true}) {
    cut.next(qorsim::silence(level)).next(qorsim::silence(level));
    TextMap map{{"async_out_data", "9"}};
    TextMap* pointer = &map;
    EXPECT_EQ(QorVIO_writeValues(board.session, first, &pointer), failed);
    EXPECT_EQ(QorVIO_readValues(board.session, first, &pointer), failed);
    const std::string what = level ? "all ones" : "all zeros";
    EXPECT_THAT(board.takeMessages(),
                testing::Each("100 device 0, user chain 1, core 0: no debug hub answers, TDO is " + what));
    EXPECT_EQ(map, (TextMap{{"async_out_data", "9"}}));
    TextMap values = core.read();
    EXPECT_EQ(values["async_in_data"], "6");
    EXPECT_EQ(values["async_in_data.activity_up"], "6");  // told again rather than lost
  }
  EXPECT_EQ(core.read()["async_in_data.activity_up"], "0");
}

TEST(Links, ToACoreOfOtherWidthsAreRefused) {
  auto narrow = chain().device(0x11).core(1, 0, vio().asyncOut(4).asyncIn(4)).cable();
  Board board(std::move(narrow));
  VioCore core(board, first);
  std::string write =
      "00 1 0 01 0 0000000B 000\n00 1 0 02 0 00000004 0";  // 10 bits of data, the core takes 8
  EXPECT_THROW(QorRT::Qor_CoreComm::commandSequence(board.session, write, nullptr, 0, nullptr),
               std::runtime_error);
  std::string read = "00 1 0 03 1 00000014 0\n00 1 0 04 1 00000004 0";  // one input, the core has four
  unsigned char result[4] = {0xAA, 0xAA, 0xAA, 0xAA};
  EXPECT_THROW(QorRT::Qor_CoreComm::commandSequence(board.session, read, result, 32, nullptr),
               std::runtime_error);
  EXPECT_THAT(result, testing::Each(0xAA));
}

}  // namespace

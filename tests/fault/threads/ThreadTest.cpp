// Many threads on cores and sessions: for ThreadSanitizer, and for the values.
#include <atomic>
#include <functional>
#include <optional>
#include <thread>

#include "tests/system/Board.h"

namespace {

using qorsim::chain;
using qorsim::loopback;
using qorsim::vio;

constexpr QOR_CORE_REF first{0, 1, 0};
constexpr unsigned workers = 6, rounds = 20;

/// Calls `job` once in each of `workers` threads, with a number of its own.
void together(const std::function<void(unsigned worker)>& job) {
  std::vector<std::thread> threads;
  for (unsigned worker = 0; worker < workers; ++worker) threads.emplace_back(job, worker);
  for (std::thread& thread : threads) thread.join();
}

qorsim::CoreSpec core() {
  return vio().asyncOut(4 * workers).asyncIn(4 * workers).syncOut(4).syncIn(4).design(loopback());
}

std::string digit(unsigned value) {
  return std::string(1, "0123456789ABCDEF"[value % 16]);
}

TEST(Threads, ShareACoreItsNamesAndItsMessages) {
  Board board(chain().device(0x11).core(1, 0, core()).cable());
  VioCore shared(board, first);
  std::atomic<unsigned> messages{0};
  QorJtag_session_setMessageHandler(board.session, [&](unsigned, const char*) { ++messages; });
  together([&](unsigned worker) {
    const std::string name = "nibble " + std::to_string(worker);
    const unsigned bit = 4 * worker;
    for (unsigned round = 0; round < rounds; ++round) {
      for (PortType port : {asyncOut, asyncIn}) shared.define(name, port, {bit, bit + 1, bit + 2, bit + 3});
      shared.write({{name, digit(worker + round)}});
      EXPECT_EQ(shared.read()[name], digit(worker + round));
      for (PortType port : {asyncOut, asyncIn})
        EXPECT_EQ(QorVIO_undefineName(board.session, first, name.c_str(), port), 0U);
      EXPECT_EQ(QorVIO_undefineName(board.session, first, name.c_str(), asyncOut), failed);
    }
  });
  EXPECT_EQ(messages, workers * rounds);
}

TEST(Threads, HaveACoreEachAndSomeSetTheirsUpAnew) {
  auto builder = chain().device(0x11);
  for (unsigned worker = 0; worker < workers; ++worker) builder.core(1 + worker % 3, worker, core());
  Board boards[] = {Board(builder.cable()), Board(chain().device().device(0x12).core(2, 5, core()).cable())};
  together([&](unsigned worker) {
    const bool isAlone = worker == 0;  // on the other board
    VioCore own(boards[isAlone ? 1 : 0],
                isAlone ? QOR_CORE_REF{1, 2, 5} : QOR_CORE_REF{0, 1 + worker % 3, worker});
    for (unsigned round = 0; round < rounds; ++round) {
      if (worker % 2 == 1) {
        EXPECT_EQ(QorVIO_terminateCore(own.session, own.ref), 0U);
        EXPECT_EQ(QorRT::Qor_CoreList::getCore(own.session, own.ref), nullptr);
        EXPECT_EQ(QorVIO_initCore(own.session, own.ref), 0U);
      }
      for (int look = 0; look < 50; ++look)  // meanwhile others change the list
        EXPECT_NE(QorRT::Qor_CoreList::getCore(own.session, own.ref), nullptr);
      Board brief("sim:");  // and the table of sessions
      EXPECT_EQ(VioCore(brief, first).read()["async_in_data"], "00");
      own.write({{"async_out_data", digit(worker) + digit(round) + "0000"}, {"sync_out_data", digit(round)}});
      TextMap values = own.read();
      EXPECT_EQ(values["async_in_data"], digit(worker) + digit(round) + "0000");
      EXPECT_EQ(values["sync_in_data"], digit(round));
    }
  });
  EXPECT_THAT(boards[0].takeMessages(), testing::IsEmpty());
}

TEST(Threads, AreToldThatALockWasNotFreeInTime) {
  Board board("sim:"), other("sim:");
  std::optional<QorRT::QorJtagTargetLock> held(std::in_place, board.session, 1000);
  std::atomic<unsigned> timedOut{0};
  together([&](unsigned worker) {
    try {
      QorRT::QorJtagTargetLock lock(worker == 0 ? other.session : board.session, worker == 0 ? 60000 : 20);
    } catch (const std::logic_error& failure) {
      EXPECT_EQ(failure.what(),
                "session " + std::to_string(board.session) + ": the target lock was not free within 20 ms");
      ++timedOut;
    }
  });
  EXPECT_EQ(timedOut, workers - 1);
  // A waiting call gets the lock as soon as it is free.
  std::thread waiting([&] { VioCore(board, first).write({{"async_out_data", "5"}}); });
  held.reset();
  waiting.join();
  EXPECT_EQ(VioCore(board, first).read()["async_in_data"], "05");
}

}  // namespace

#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <future>
#include <string>
#include <vector>

#include "QorJtag.h"
#include "platform/jtag/Qor_SessionAccess.h"
#include "tests/platform/ScriptedCable.h"

namespace {

using QorRT::QorJtagTargetLock;

std::string lockThrows(unsigned session, unsigned timeout) {
  return thrownBy([=] { const QorJtagTargetLock lock(session, timeout); });
}

TEST(Session, OpensOnlyCablesThatAUrlNames) {
  const auto opening = [](const char* url) { return thrownBy([=] { QorJtag_session_open(url); }); };
  EXPECT_EQ(opening(nullptr), "logic: the cable URL is null");
  EXPECT_EQ(opening(""), "logic: the cable URL is empty");
  EXPECT_EQ(opening("sim"), "logic: the cable URL \"sim\" has no colon after its kind");
  EXPECT_EQ(opening(":"), "logic: the cable URL \":\" is of the unknown kind \"\"; known: sim, rbb, openocd");
  EXPECT_EQ(opening("Sim:x:y"),
            "logic: the cable URL \"Sim:x:y\" is of the unknown kind \"Sim\"; known: sim, rbb, openocd");
  EXPECT_EQ(thrownBy([] { QorJtag_session_openCable(nullptr); }), "logic: the cable of a session is null");
}

TEST(Session, TellsAnUnknownHandleFromAClosedOne) {
  ScriptedSession session;
  const unsigned handle = session.handle;
  ASSERT_NE(handle, 0U);
  session.close();
  EXPECT_TRUE(session.script->destroyed);
  ScriptedSession next;
  EXPECT_EQ(next.handle, handle + 1);
  for (const unsigned gone : {handle, handle + 2, 0U}) {
    const std::string thrown = gone == handle ? "logic: session " + std::to_string(gone) + " is closed"
                                              : "logic: unknown session " + std::to_string(gone);
    std::vector<QorRT::Qor_Device> devices(1);
    std::vector<QorJtag_Hub> hubs;
    QorJtag_Statistics statistics;
    const std::function<void()> calls[] = {
        [&] { QorJtagTargetLock(gone, 1); },
        [&] { QorJtag_session_close(gone); },
        [&] { QorJtag_session_setMessageHandler(gone, nullptr); },
        [&] { QorJtag_session_getDevices(gone, devices); },
        [&] { QorJtag_session_getHubs(gone, hubs); },
        [&] { QorJtag_session_getStatistics(gone, statistics); },
        [&] { QorJtag_target_flush(gone); },
        [&] { QorRT::sessionCable(gone); },
        [&] { QorRT::onSessionClose(gone, nullptr); },
    };
    for (const auto& call : calls) EXPECT_EQ(thrownBy(call), thrown);
    EXPECT_EQ(devices.size(), 1U);
  }
}

TEST(Session, ShowsItsChainAndFlushesItsCable) {
  ScriptedSession session;
  std::vector<QorRT::Qor_Device> devices;
  QorJtag_session_getDevices(session.handle, devices);
  ASSERT_EQ(devices.size(), 2U);
  EXPECT_EQ(devices[0].name + ", " + devices[1].name, "near, far");
  const QorJtagTargetLock lock(session.handle, 1000);
  QorRT::sessionCable(session.handle).idle(5);
  EXPECT_EQ(QorJtag_target_flush(session.handle), 0U);
  EXPECT_EQ(session.script->log, std::vector<std::string>({"idle 5", "run"}));
}

/// What a thread gets that waits for the target lock while the session is being closed.
std::string waitDuringClose() {
  ScriptedSession session;
  std::future<void> closed;
  std::future<std::string> waiter;
  {
    const QorJtagTargetLock lock(session.handle, 1000);
    closed = std::async(std::launch::async, [&] { session.close(); });
    EXPECT_EQ(closed.wait_for(std::chrono::milliseconds(5)), std::future_status::timeout);
    waiter = std::async(std::launch::async, lockThrows, session.handle, 60000);
    EXPECT_EQ(waiter.wait_for(std::chrono::milliseconds(5)), std::future_status::timeout);
    QorRT::sessionCable(session.handle).idle(1);
    EXPECT_FALSE(session.script->destroyed);
  }
  closed.get();
  EXPECT_EQ(lockThrows(session.handle, 1), "logic: session " + std::to_string(session.handle) + " is closed");
  return waiter.get();
}

TEST(Session, ClosesAfterTheHolderOfItsLockAndTurnsTheWaitersAway) {
  std::string thrown = "nothing";  // as long as the waiter has the lock before the closing thread
  for (int i = 0; i < 100 && thrown == "nothing"; ++i) thrown = waitDuringClose();
  EXPECT_EQ(thrown.substr(thrown.size() - 10), " is closed");
}

std::vector<unsigned> hooked;
void noteClose(unsigned session) noexcept {
  hooked.push_back(session);
  EXPECT_EQ(lockThrows(session, 1), "logic: session " + std::to_string(session) + " is closed");
}

TEST(Session, CallsEachCloseHookOnce) {
  ScriptedSession session;
  QorRT::onSessionClose(session.handle, noteClose);
  QorRT::onSessionClose(session.handle, noteClose);
  hooked.clear();
  session.close();
  EXPECT_EQ(hooked, std::vector<unsigned>({session.handle}));
}

TEST(Messages, GoToTheHandlerOfTheSessionOrToStderrOneALine) {
  ScriptedSession session;
  const unsigned handle = session.handle;
  const std::string prefix = "session " + std::to_string(handle);
  std::vector<std::string> seen;
  QorJtag_session_setMessageHandler(handle, [&](unsigned type, const char* text) {
    seen.push_back(std::to_string(type) + " " + text);
    QorJtag_session_setMessageHandler(handle, [](unsigned, const char*) { throw 1; });
  });
  testing::internal::CaptureStderr();
  EXPECT_EQ(QorJtag_session_sendMessage(handle, 0x100, "first"), 0U);
  EXPECT_EQ(QorJtag_session_sendMessage(handle, 0x8000, "second"), 1U);
  QorJtag_session_setMessageHandler(handle, nullptr);
  EXPECT_EQ(QorJtag_session_sendMessage(handle, 0x100, "seen"), 0U);
  EXPECT_EQ(QorJtag_session_sendMessage(handle, 0x100, nullptr), 0U);
  EXPECT_EQ(QorJtag_session_sendMessage(0, 0x100, "lost"), 1U);
  EXPECT_EQ(testing::internal::GetCapturedStderr(), prefix + ": seen\n" + prefix + ": \nsession 0: lost\n");
  EXPECT_EQ(seen, std::vector<std::string>({"256 first"}));
}

}  // namespace

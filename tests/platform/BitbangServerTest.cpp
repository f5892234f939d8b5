// The remote_bitbang server, with clients that behave and clients that do not.
#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <sys/socket.h>
#include <unistd.h>
#include <array>
#include <atomic>
#include <thread>

#include "BitbangServer.h"

namespace {

/// Keeps what was set, as 0 to 7 and T or t for TRST, and answers the last TDI.
class NotedPins : public qorsim::Pins {
 public:
  void write(bool tck, bool tms, bool tdi) override {
    notes += static_cast<char>('0' + 4 * tck + 2 * tms + tdi);
    tdi_ = tdi;
  }
  bool tdo() override { return tdi_; }
  void setTrst(bool asserted) override { notes += asserted ? 'T' : 't'; }

  std::string notes;

 private:
  bool tdi_ = false;
};

class BitbangServerTest : public testing::Test {
 protected:
  explicit BitbangServerTest(std::chrono::milliseconds idleLimit = std::chrono::hours(1))
      : server(pins, 0, idleLimit) {}
  ~BitbangServerTest() override { end(); }

  void end() {
    stop_ = true;
    if (thread_.joinable()) thread_.join();
  }

  int connect() const {
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    address.sin_port = htons(server.port());
    const int client = ::socket(AF_INET, SOCK_STREAM, 0), small = 65536;
    ::setsockopt(client, SOL_SOCKET, SO_SNDBUF, &small, sizeof small);
    ::setsockopt(client, SOL_SOCKET, SO_RCVBUF, &small, sizeof small);
    EXPECT_EQ(::connect(client, reinterpret_cast<const sockaddr*>(&address), sizeof address), 0);
    return client;
  }

  // All answers until the server closes, which it need not see this end do.
  static std::string talk(int client, const std::string& requests) {
    std::size_t sent = 0;
    while (sent < requests.size())
      sent += static_cast<std::size_t>(::send(client, requests.data() + sent, requests.size() - sent, 0));
    std::string answers;
    std::array<char, 65536> block{};
    for (ssize_t count = 1; count > 0; answers.append(block.data(), static_cast<std::size_t>(count)))
      count = std::max<ssize_t>(::recv(client, block.data(), block.size(), 0), 0);
    ::close(client);
    return answers;
  }

  NotedPins pins;
  qorsim::BitbangServer server;
  std::string told;

 private:
  std::atomic<bool> stop_{false};
  std::thread thread_{[this] {
    server.serve([this] { return stop_.load(); },
                 [this](const std::string& reason) { told += reason + ";"; });
  }};
};

TEST_F(BitbangServerTest, ServesOneClientAfterAnotherOnTheSameWires) {
  const int first = connect(), second = connect();
  EXPECT_EQ(talk(first, "01R234567RBbrstuQ5R"), "11");
  EXPECT_EQ(talk(second, "RRQ"), "11");
  EXPECT_EQ(talk(connect(), "0R?1"), "0");
  EXPECT_EQ(talk(connect(), "1R\n"), "1");
  const int staying = connect();
  ASSERT_EQ(::send(staying, "R", 1, 0), 1);
  char answer = 0;
  ASSERT_EQ(::recv(staying, &answer, 1, 0), 1);
  end();
  EXPECT_EQ(answer, '1');
  EXPECT_EQ(::recv(staying, &answer, 1, 0), 0);
  ::close(staying);
  EXPECT_EQ(pins.notes, "01234567ttTT01");
  EXPECT_EQ(told,
            "the client sent a character that means nothing: \"?\";"
            "the client sent a character that means nothing: number 10;");
}

TEST_F(BitbangServerTest, AnswersAClientThatSendsEverythingBeforeItReads) {
  std::string requests, answers;
  for (int i = 0; i < 2000000; ++i) {
    requests += i % 3 == 0 ? "5RRRR" : "0RRRR";
    answers += i % 3 == 0 ? "1111" : "0000";
  }
  EXPECT_TRUE(talk(connect(), requests + "Q") == answers);
}

class IdleBitbangClientTest : public BitbangServerTest {
 protected:
  IdleBitbangClientTest() : BitbangServerTest(std::chrono::milliseconds(1)) {}
};

TEST_F(IdleBitbangClientTest, SendsAnIdleClientAwayWhenAnotherOneWaits) {
  const int idle = connect();
  char answer = 0;
  ASSERT_EQ(::send(idle, "1R", 2, 0), 2);
  ASSERT_EQ(::recv(idle, &answer, 1, 0), 1);
  EXPECT_EQ(talk(connect(), "RQ"), "1");
  EXPECT_EQ(talk(idle, ""), "");
  end();
  EXPECT_EQ(told, "the client was idle while another one waited;");
}

}  // namespace

// The remote_bitbang server, with clients that behave and clients that do not.
#include "BitbangServer.h"

#include <gtest/gtest.h>

#include <atomic>
#include <boost/asio/io_context.hpp>
#include <boost/asio/ip/tcp.hpp>
#include <boost/asio/read.hpp>
#include <boost/asio/write.hpp>
#include <thread>

namespace {

using boost::asio::buffer;
using boost::asio::ip::tcp;

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

class BitbangServer : public testing::Test {
 protected:
  explicit BitbangServer(std::chrono::milliseconds idleLimit = std::chrono::hours(1))
      : server(pins, 0, idleLimit) {}
  ~BitbangServer() override { end(); }

  void end() {
    stop_ = true;
    if (thread_.joinable()) thread_.join();
  }

  tcp::socket connect() {
    tcp::socket client(io_);
    client.connect({boost::asio::ip::address_v4::loopback(), server.port()});
    return client;
  }

  // All answers until the server closes, which it need not see this end do.
  static std::string talk(tcp::socket client, const std::string& requests) {
    boost::asio::write(client, buffer(requests));
    std::string answers;
    boost::system::error_code end;
    boost::asio::read(client, boost::asio::dynamic_buffer(answers), end);
    return answers;
  }

  // One answer of a client that stays.
  static std::string ask(tcp::socket& client, const std::string& requests) {
    std::string answer(1, '?');
    boost::asio::write(client, buffer(requests));
    boost::asio::read(client, buffer(answer));
    return answer;
  }

  NotedPins pins;
  qorsim::BitbangServer server;
  std::string told;

 private:
  boost::asio::io_context io_;
  std::atomic<bool> stop_{false};
  std::thread thread_{[this] {
    server.serve([this] { return stop_.load(); },
                 [this](const std::string& reason) { told += reason + ";"; });
  }};
};

TEST_F(BitbangServer, ServesOneClientAfterAnotherOnTheSameWires) {
  tcp::socket first = connect(), second = connect();
  EXPECT_EQ(talk(std::move(first), "01R234567RBbrstuQ5R"), "11");
  EXPECT_EQ(talk(std::move(second), "RRQ"), "11");
  EXPECT_EQ(talk(connect(), "0R?1"), "0");
  EXPECT_EQ(talk(connect(), "1R\n"), "1");
  tcp::socket staying = connect();
  EXPECT_EQ(ask(staying, "R"), "1");
  end();
  EXPECT_EQ(talk(std::move(staying), ""), "");
  EXPECT_EQ(pins.notes, "01234567ttTT01");
  EXPECT_EQ(told,
            "the client sent a character that means nothing: \"?\";"
            "the client sent a character that means nothing: number 10;");
}

TEST_F(BitbangServer, AnswersAClientThatSendsEverythingBeforeItReads) {
  std::string requests, answers;
  for (int i = 0; i < 2000000; ++i) {
    requests += i % 3 == 0 ? "5RRRR" : "0RRRR";
    answers += i % 3 == 0 ? "1111" : "0000";
  }
  EXPECT_TRUE(talk(connect(), requests + "Q") == answers);
}

class IdleBitbangClient : public BitbangServer {
 protected:
  IdleBitbangClient() : BitbangServer(std::chrono::milliseconds(1)) {}
};

TEST_F(IdleBitbangClient, IsSentAwayWhenAnotherOneWaits) {
  tcp::socket idle = connect();
  EXPECT_EQ(ask(idle, "1R"), "1");
  EXPECT_EQ(talk(connect(), "RQ"), "1");
  EXPECT_EQ(talk(std::move(idle), ""), "");
  end();
  EXPECT_EQ(told, "the client was idle while another one waited;");
}

}  // namespace

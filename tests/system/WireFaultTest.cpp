// What can happen between a host and a real chain: each fault ends in a message that says what was seen, with the
// target lock free, and the session works again when the link does. By a remote_bitbang cable, and through OpenOCD.
#include <dlfcn.h>
#include <netdb.h>
#include <signal.h>
#include <sys/stat.h>

#include <atomic>
#include <boost/asio/io_context.hpp>
#include <boost/asio/ip/tcp.hpp>
#include <boost/asio/write.hpp>
#include <boost/process/child.hpp>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <optional>
#include <regex>
#include <set>
#include <thread>

#include "BitbangServer.h"
#include "SimPins.h"
#include "platform/jtag/cable/wire/Stream.h"
#include "tests/system/Board.h"

namespace {

using boost::asio::ip::tcp;

const std::string config = QORVIO_SOURCE_DIR "/rtl/cosim/openocd.cfg";
constexpr QOR_CORE_REF first{0, 1, 0};

void pause(int milliseconds) {
  std::this_thread::sleep_for(std::chrono::milliseconds(milliseconds));
}

enum class Fault { none, low, withhold, die };

/// The wires of the demo board, with a fault on them.
class FaultyPins : public qorsim::Pins {
 public:
  void write(bool tck, bool tms, bool tdi) override {
    if (fault == Fault::die && --countdown <= 0) throw std::runtime_error("the simulation ends here");
    board_->write(tck, tms, tdi);
    ++writes;
  }
  bool tdo() override {
    while (fault == Fault::withhold) pause(5);
    return fault != Fault::low && board_->tdo();
  }
  void setTrst(bool asserted) override { board_->setTrst(asserted); }

  std::atomic<unsigned> writes{0};  // two a TCK
  std::atomic<Fault> fault{Fault::none};
  std::atomic<int> countdown{0};  // steps before `die`

 private:
  std::unique_ptr<qorsim::Pins> board_ = qorsim::demoBoard().pins();
};

/// A demo board at a server, which can die and come back at the same port.
class Wires : public testing::Test {
 protected:
  Wires() {
    start();
    setenv("QORVIO_BOARD_PORT", std::to_string(port_).c_str(), 1);
  }
  ~Wires() override { stop(); }

  void restart() {
    stop();
    start();
  }

  const std::string openOcd = "openocd:?config=" + config;
  std::string bitbang() const { return "rbb:127.0.0.1:" + std::to_string(port_); }

  FaultyPins pins;

 private:
  void start() {
    stopped_ = false;
    server_.emplace(pins, port_);
    port_ = server_->port();
    thread_ = std::thread([this] {
      try {
        server_->serve([this] { return stopped_.load(); });
      } catch (const std::runtime_error&) {  // a fault that ends it
        server_.reset();
      }
    });
  }
  void stop() {
    pins.fault = Fault::none;
    stopped_ = true;
    thread_.join();
    server_.reset();
  }

  std::uint16_t port_ = 0;
  std::atomic<bool> stopped_{false};
  std::optional<qorsim::BitbangServer> server_;
  std::thread thread_;
};

// With the place of the server, and how many answers came, in words; a server that ends may still say why, or not.
std::string placeless(std::string message) {
  const std::pair<const char*, const char*> words[] = {
      {R"(127\.0\.0\.1:\d+)", "HOST:PORT"},
      {"gave [1-9][0-9]* of", "gave N of"},
      {"gave 0 of 191", "gave N of 191"},
      {"the server could not run the scans: drscan: jtag execute failed",
       "openocd gave no answer, then closed the connection"}};
  for (const auto& [seen, said] : words) message = std::regex_replace(message, std::regex(seen), said);
  return message;
}

/// What a read reports that must fail.
std::string failedRead(Board& board) {
  TextMap values, *map = &values;
  EXPECT_EQ(QorVIO_readValues(board.session, first, &map), failed);
  EXPECT_TRUE(values.empty());
  { QorRT::QorJtagTargetLock free(board.session, 0); }
  const std::vector<std::string> messages = board.takeMessages();
  EXPECT_EQ(messages.size(), 1U);
  return placeless(
      std::regex_replace(messages.at(0), std::regex("^100 device 0, user chain 1, core 0: "), ""));
}

void expectRoundTrip(VioCore& core) {
  core.write({{"async_out_data", "A7"}});
  EXPECT_EQ(core.read()["async_in_data"], "A7");
}

TEST_F(Wires, MayFailWithinASession) {
  const std::string silent = "no debug hub answers, TDO is all zeros, in 4 attempts",
                    ended = "openocd gave no answer, then closed the connection";
  const struct {
    Fault fault;
    int steps;
    std::string byBitbang, byOpenOcd;
  } rows[] = {
      {Fault::low, 0, silent, silent},
      {Fault::withhold, 0, "HOST:PORT gave N of 191 answers within 1.1 s",
       "openocd gave no answer within 1.1 s"},
      {Fault::die, 150, "HOST:PORT gave N of 191 answers, then closed the connection", ended},
  };
  for (const auto& row : rows) {
    pins.setTrst(true);  // as a client before may have left it
    for (const auto& [url, said] :
         {std::pair(bitbang() + "?timeout=1", row.byBitbang), {openOcd + "&timeout=1", row.byOpenOcd}}) {
      Board board(url);
      VioCore core(board, first);
      core.write({{"async_out_data", "5A"}});
      core.read();
      pins.countdown = row.steps;
      pins.fault = row.fault;
      EXPECT_EQ(failedRead(board), said);
      pins.fault = Fault::none;
      if (row.fault == Fault::die) restart();
      expectRoundTrip(core);
    }
  }
}

// Only as long as nothing went wrong: the chain has no other way back to the instruction.
TEST_F(Wires, OfOurOwnSelectAnInstructionOnce) {
  for (const std::string& url : {bitbang(), openOcd}) {
    const auto cable = QorRT::openCable(url.c_str());
    const auto hasIrScan = [&](unsigned device, unsigned userChain, bool always) {
      pins.writes = 0;
      cable->scanIr(device, userChain, always);
      cable->scanDr(device, {1}, 8, true);
      cable->flush();
      return pins.writes > 2 * (9 + 14);  // both devices' bits, and the walks of one scan or two
    };
    EXPECT_TRUE(hasIrScan(0, 1, false)) << url;
    EXPECT_FALSE(hasIrScan(0, 1, false)) << url;
    EXPECT_TRUE(hasIrScan(0, 1, true)) << url;
    EXPECT_TRUE(hasIrScan(0, 2, false)) << url;
    EXPECT_TRUE(hasIrScan(1, 2, false)) << url;
  }
}

TEST_F(Wires, TakeNoStandardStream) {
  for (const std::string& url : {bitbang(), openOcd}) {
    const int kept[] = {dup(0), dup(1), dup(2)};
    for (int each = 0; each < 3; ++each) close(each);
    int taken = 0;
    {
      Board board(url);
      VioCore(board, first).read();
      struct stat status {};
      for (int each = 0; each < 3; ++each)
        if (fstat(each, &status) == 0) taken += S_ISSOCK(status.st_mode) || S_ISFIFO(status.st_mode) ? 1 : 0;
    }
    for (int each = 0; each < 3; ++each) {
      dup2(kept[each], each);
      close(kept[each]);
    }
    EXPECT_EQ(taken, 0) << url;
  }
}

/// An OpenOCD server of somebody else in front of a served board, always at the same port.
class OpenOcdServer : public Wires {
 protected:
  OpenOcdServer() { start(); }

  void start() {
    process = boost::process::child("/bin/sh", "-c",
                                    "exec openocd -l " + log + " -f " + config + " -c '" + ports + "'");
    while (process.running() && !answers()) pause(25);
  }
  std::string ask(const std::string& command) const {
    const QorRT::Deadline deadline(QorRT::Seconds(60));
    return QorRT::Stream({"127.0.0.1", port}, deadline, {}).ask(command + '\x1A', '\x1A', 1000, deadline);
  }

  const std::string port = std::to_string(qorsim::BitbangServer(pins, 0).port());
  const std::string ports = "bindto 127.0.0.1; telnet_port disabled; gdb_port disabled; tcl_port " + port;
  const std::string url = "openocd:127.0.0.1:" + port + "?timeout=1";
  const std::string log = testing::TempDir() + "openocd_" + std::to_string(getpid()) + ".log";
  boost::process::child process;

 private:
  bool answers() const {
    try {
      return QorRT::openCable(url.c_str()) != nullptr;
    } catch (const std::runtime_error&) {
      return false;
    }
  }
};

TEST_F(OpenOcdServer, MayHangOrDieAndComeBackWithinASession) {
  Board board(url);
  VioCore core(board, first);
  core.write({{"async_out_data", "00"}});
  core.read();
  core.write({{"async_out_data", "5A"}});
  ::kill(process.id(), SIGSTOP);
  EXPECT_EQ(failedRead(board), "HOST:PORT gave no answer within 1.1 s");
  ::kill(process.id(), SIGCONT);
  EXPECT_EQ(core.read()["async_in_data.activity_up"], "5A");  // even if the hanging read was carried out
  process.terminate();
  EXPECT_EQ(failedRead(board), "HOST:PORT gave no answer, then closed the connection");
  EXPECT_EQ(failedRead(board), "HOST:PORT cannot be reached: Connection refused");
  start();
  expectRoundTrip(core);
}

TEST_F(OpenOcdServer, LogsNoScanAndIsAsLoudAsBefore) {
  ask("debug_level 1");
  {
    Board one(url), other(url);
    for (Board* board : {&one, &other, &one}) VioCore(*board, first).read();
    one.close();
    VioCore(other, first).read();
  }
  EXPECT_EQ(ask("debug_level"), "debug_level: 1\n");
  std::ifstream text(log);
  EXPECT_EQ(std::string(std::istreambuf_iterator<char>(text), {}).find("ok "), std::string::npos);
}

TEST_F(OpenOcdServer, KeepsTheInstructionOfAnotherClientWhenACableIsOpened) {
  ask("irscan fpga.tap 2");
  const Board board(url);
  EXPECT_EQ(ask("drscan fpga.tap 8 0"), "01");  // a hub's hello
}

// What a cable says that cannot be opened.
std::string refusal(const std::string& url, QorRT::StopFunction stop = {}) {
  try {
    QorRT::openCable(url.c_str(), std::move(stop));
  } catch (const std::exception& error) {
    return placeless(error.what());
  }
  return "nothing";
}

std::string written(const std::string& name, const std::string& text) {
  std::string path = testing::TempDir() + name;
  std::ofstream(path) << text;
  return path;
}

TEST_F(Wires, AreCheckedByAnOpenOcdOfOurOwn) {
  const auto adapter = [](const std::string& port, unsigned irLength) {
    return "adapter driver remote_bitbang\nremote_bitbang host 127.0.0.1\nremote_bitbang port " + port +
           "\ntransport select jtag\njtag newtap fpga tap -expected-id 0x0A5F1093 -irlen " +
           std::to_string(irLength) + "\n";
  };
  const std::string port = "$::env(QORVIO_BOARD_PORT)", cpld = "jtag newtap cpld tap -irlen 8\n";
  const std::pair<std::string, std::string> rows[] = {
      {openOcd, "nothing"},
      {"openocd:?config=missing.cfg",
       "openocd has ended; it says: couldn't read file \"missing.cfg\": No such file or directory"},
      {"openocd:?config=" + written("nobody.cfg", adapter("1", 6)), "openocd has ended; it says: "},
      {"openocd:?config=" + written("extra.cfg", adapter(port, 6)),
       "the chain has a device that the server's configuration does not name: auto0.tap, IDCODE 1234567B, an "
       "IR of 8 bits by its capture"},
      {"openocd:?config=" + written("longer.cfg", adapter(port, 7) + cpld),
       "openocd does not trust the chain; it says: cpld.tap: IR capture error; saw 0x80 not 0x1"},
      {"openocd:?timeout=1",
       "the cable URL \"openocd:?timeout=1\" must name a server, HOST:PORT, or a configuration to start one, "
       "?config=FILE"},
  };
  for (const auto& [url, said] : rows) EXPECT_THAT(refusal(url), testing::StartsWith(said));
}

/// A server that nobody should trust: to whoever connects it sends a text, again and again, with a pause between.
class BadServer {
 public:
  BadServer(const std::string& text, int milliseconds)
      : thread_([this, text, milliseconds] {
          tcp::socket client = acceptor_.accept();
          for (boost::system::error_code gone; !gone && !stopped_; pause(milliseconds))
            boost::asio::write(client, boost::asio::buffer(text), gone);
        }) {}
  ~BadServer() {
    stopped_ = true;
    thread_.join();
  }

  std::string place() const { return "127.0.0.1:" + std::to_string(acceptor_.local_endpoint().port()); }

 private:
  boost::asio::io_context io_;
  tcp::acceptor acceptor_{io_, {boost::asio::ip::address_v4::loopback(), 0}};
  std::atomic<bool> stopped_{false};
  std::thread thread_;
};

std::atomic<bool> namesAreFound{false};

TEST(BadServers, AreWaitedForNoLongerThanAnExchangeMayTake) {
  const auto atOnce = [] { return true; };
  const struct {
    const char *text, *kind, *options, *said;
    int pause;
    QorRT::StopFunction stop;
  } rows[] = {
      {"0", "rbb:", "?timeout=0.3", "HOST:PORT gave N of 2081 answers within 0.6 s", 20, {}},
      {"x", "openocd:", "?timeout=0.3", "HOST:PORT gave no answer within 0.3 s", 20, {}},
      {"", "rbb:", "?timeout=60", "HOST:PORT gave 0 of 2081 answers before the host stopped the wait", 20,
       atOnce},
      {"", "openocd:", "?timeout=60", "HOST:PORT gave no answer before the host stopped the wait", 20,
       atOnce},
      {"0123456789", "openocd:", "?timeout=20", "HOST:PORT answered more than 65536 bytes", 0, {}},
      {"0123456789", "rbb:", "?timeout=20", "HOST:PORT gave more answers than the 2081 that were due", 0, {}},
  };
  for (const auto& each : rows) {
    const BadServer server(each.text, each.pause);
    EXPECT_EQ(refusal(each.kind + server.place() + each.options, each.stop), each.said);
  }
}

TEST(BadServers, MayHaveANameThatNobodyFinds) {
  EXPECT_EQ(refusal("rbb:nobody.invalid:1?timeout=0.3"), "nobody.invalid:1 could not be found within 0.6 s");
  EXPECT_EQ(refusal("openocd:nobody.invalid:1?timeout=60", [] { return true; }),
            "nobody.invalid:1 could not be found before the host stopped the wait");
  namesAreFound = true;
  EXPECT_EQ(refusal("rbb:nobody.invalid:1"),
            "nobody.invalid:1 cannot be found: Host not found (authoritative)");
}

/// The ids of our children.
std::vector<std::string> children() {
  std::ifstream list("/proc/self/task/" + std::to_string(getpid()) + "/children");
  return {std::istream_iterator<std::string>(list), {}};
}

TEST_F(Wires, OpenOcdHasNothingOfItsHostAndEndsThoughACopyOfThatLives) {
  const std::size_t before = children().size();
  std::optional<Board> board(openOcd);
  ASSERT_EQ(children().size(), before + 1);
  const std::string process = "/proc/" + children().back();
  std::set<std::string> descriptors;
  for (const auto& each : std::filesystem::directory_iterator(process + "/fd"))
    descriptors.insert(each.path().filename());
  EXPECT_THAT(descriptors, ElementsAre("0", "1", "2", "3"));  // the last is its own connection to the board
  const pid_t copy = fork();
  if (copy == 0) {
    ::pause();
    _exit(0);
  }
  board.reset();
  EXPECT_FALSE(std::filesystem::exists(process));  // not even a zombie
  ::kill(copy, SIGKILL);
  waitpid(copy, nullptr, 0);
}

void* readForEver(void* board) {
  unsigned char bits = 0;
  for (const unsigned session = static_cast<Board*>(board)->session;;)
    QorVIO_getPortBits(session, {0, 1, 0}, &bits, nullptr, nullptr, 8, nullptr, nullptr, nullptr, nullptr,
                       nullptr, 0);
}

TEST_F(Wires, StayWhenAThreadThatReadsIsCancelled) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "AddressSanitizer aborts when a cancelled thread unwinds";
#endif
  Board board(openOcd);
  VioCore core(board, {0, 1, 0});
  const std::string before = children().back();
  for (int i = 0; i < 50; ++i) {
    pthread_t thread;
    ASSERT_EQ(pthread_create(&thread, nullptr, readForEver, &board), 0);
    std::this_thread::sleep_for(std::chrono::microseconds(100 * i));
    pthread_cancel(thread);
    pthread_join(thread, nullptr);
  }
  core.read();
  EXPECT_EQ(children().back(), before);
}

}  // namespace

// In the place of the system's: looks up one name for as long as a test likes.
extern "C" [[gnu::visibility("default")]] int getaddrinfo(const char* node, const char* service,
                                                          const addrinfo* hints, addrinfo** found) {
  const auto find = reinterpret_cast<int (*)(const char*, const char*, const addrinfo*, addrinfo**)>(
      dlsym(RTLD_NEXT, "getaddrinfo"));
  const bool isNumeric = hints != nullptr && (hints->ai_flags & AI_NUMERICHOST) != 0;
  if (node == nullptr || isNumeric || std::string(node) != "nobody.invalid")
    return find(node, service, hints, found);
  while (!namesAreFound) std::this_thread::sleep_for(std::chrono::milliseconds(5));
  return EAI_NONAME;
}

// What can happen between a host and a real chain: each fault ends in a message that says what was seen, with the
// target lock free, and the session works again when the link does. By a remote_bitbang cable, and through OpenOCD.
#include <dlfcn.h>
#include <netdb.h>
#include <netinet/in.h>
#include <signal.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/wait.h>

#include <atomic>
#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <optional>
#include <regex>
#include <set>
#include <sstream>
#include <thread>

#include "BitbangServer.h"
#include "SimPins.h"
#include "platform/jtag/cable/wire/Stream.h"
#include "tests/system/Board.h"

namespace {

enum class Fault { none, tdoLow, tdoHigh, flip, withhold, die };

/// The wires of the demo board, with a fault on them.
class FaultyPins : public qorsim::Pins {
 public:
  void write(bool tck, bool tms, bool tdi) override {
    if (fault == Fault::die && --countdown <= 0) throw std::runtime_error("the simulation ends here");
    board_->write(tck, tms, tdi);
    ++writes;
  }
  bool tdo() override {
    while (fault == Fault::withhold) std::this_thread::sleep_for(std::chrono::milliseconds(5));
    const bool flipped = fault == Fault::flip && --countdown == 0;
    return fault == Fault::tdoHigh || (fault != Fault::tdoLow && board_->tdo() != flipped);
  }
  void setTrst(bool asserted) override { board_->setTrst(asserted); }

  /// What happens from now on; for `die` and `flip`, after so many steps.
  void set(Fault next, int steps = 0) {
    countdown = steps;
    fault = next;
  }

  std::atomic<unsigned> writes{0};  // two a TCK

 private:
  std::unique_ptr<qorsim::Pins> board_ = qorsim::demoBoard().pins();
  std::atomic<Fault> fault{Fault::none};
  std::atomic<int> countdown{0};
};

/// The demo board behind a server, which can die and come back at the same port.
class ServedBoard {
 public:
  ServedBoard() { start(); }
  ~ServedBoard() { stop(); }

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
    pins.set(Fault::none);
    stopped_ = true;
    if (thread_.joinable()) thread_.join();
    server_.reset();
  }
  void restart() {
    stop();
    start();
  }

  std::string port() const { return std::to_string(port_); }

  FaultyPins pins;

 private:
  std::uint16_t port_ = 0;
  std::atomic<bool> stopped_{false};
  std::optional<qorsim::BitbangServer> server_;
  std::thread thread_;
};

struct Case {
  const char* name;
  Fault fault;
  int steps;
  const char* byBitbang;  // what is said of it; nothing of what a repeat mends
  const char* byOpenOcd;
};

void PrintTo(const Case& each, std::ostream* out) {
  *out << each.name;
}

const Case cases[] = {
    {"TdoStuckAt0", Fault::tdoLow, 0, "no debug hub answers, TDO is all zeros, in 4 attempts",
     "no debug hub answers, TDO is all zeros, in 4 attempts"},
    {"TdoStuckAt1", Fault::tdoHigh, 0, "no debug hub answers, TDO is all ones, in 4 attempts",
     "no debug hub answers, TDO is all ones, in 4 attempts"},
    {"OneBitFlipped", Fault::flip, 100, nullptr, nullptr},
    {"ReplyWithheld", Fault::withhold, 0, "HOST:PORT gave N of 191 answers within 1.1 s",
     "openocd gave no answer within 1.1 s"},
    {"SimulationKilled", Fault::die, 150, "HOST:PORT gave N of 191 answers, then closed the connection",
     "openocd gave no answer, then closed the connection"},
};

// With the place of the server, and how many answers came, in words; a server that ends may still say why, or not.
std::vector<std::string> placeless(std::vector<std::string> messages) {
  const std::pair<const char*, const char*> words[] = {
      {R"(127\.0\.0\.1:\d+)", "HOST:PORT"},
      {"gave [1-9][0-9]* of", "gave N of"},
      {"gave 0 of 191", "gave N of 191"},
      {"the server could not run the scans: drscan: jtag execute failed",
       "openocd gave no answer, then closed the connection"}};
  for (std::string& message : messages)
    for (const auto& [seen, said] : words) message = std::regex_replace(message, std::regex(seen), said);
  return messages;
}

class WireFault : public testing::TestWithParam<Case> {
 protected:
  void tryOn(const std::string& url, const char* said) {
    Board board(url);
    VioCore core(board, {0, 1, 0});
    core.write({{"async_out_data", "5A"}});
    core.read();
    served.pins.set(GetParam().fault, GetParam().steps);
    TextMap values, *map = &values;
    EXPECT_EQ(QorVIO_readValues(board.session, core.ref, &map), said != nullptr ? failed : 0U);
    std::vector<std::string> messages;
    if (said != nullptr) messages.push_back(std::string("100 device 0, user chain 1, core 0: ") + said);
    EXPECT_EQ(placeless(board.takeMessages()), messages);
    EXPECT_EQ(values.empty(), said != nullptr);
    { QorRT::QorJtagTargetLock free(board.session, 0); }
    served.pins.set(Fault::none);
    if (GetParam().fault == Fault::die) served.restart();
    core.write({{"async_out_data", "A7"}});
    EXPECT_EQ(core.read()["async_in_data"], "A7");
  }

  ServedBoard served;
};

TEST_P(WireFault, IsToldByABitbangCable) {
  served.pins.setTrst(true);  // as a client before may have left it
  tryOn("rbb:127.0.0.1:" + served.port() + "?timeout=1", GetParam().byBitbang);
}

TEST_P(WireFault, IsToldThroughOpenOcd) {
  setenv("QORVIO_BOARD_PORT", served.port().c_str(), 1);
  tryOn("openocd:?config=" QORVIO_SOURCE_DIR "/rtl/cosim/openocd.cfg&timeout=1", GetParam().byOpenOcd);
}

INSTANTIATE_TEST_SUITE_P(Wire, WireFault, testing::ValuesIn(cases),
                         [](const auto& each) { return std::string(each.param.name); });

/// An OpenOCD server of somebody else in front of a served board, always at the same port.
class OpenOcd {
 public:
  explicit OpenOcd(const std::string& boardPort) : boardPort_(boardPort) {
    const auto unused = qorsim::demoBoard().pins();
    port_ = std::to_string(qorsim::BitbangServer(*unused, 0).port());
    ports_ = "bindto 127.0.0.1; telnet_port disabled; gdb_port disabled; tcl_port " + port_;
    start();
  }
  ~OpenOcd() { kill(SIGKILL); }

  std::string url() const { return "openocd:127.0.0.1:" + port_ + "?timeout=1"; }
  std::string log() const {
    std::ostringstream text;
    text << std::ifstream(log_).rdbuf();
    return text.str();
  }
  std::string ask(const std::string& command) const {
    const QorRT::Deadline deadline(QorRT::Seconds(5));
    return QorRT::Stream({"127.0.0.1", port_}, deadline, {}).ask(command + '\x1A', '\x1A', 1000, deadline);
  }

  void start() {
    setenv("QORVIO_BOARD_PORT", boardPort_.c_str(), 1);
    process_ = fork();  // what follows in the child needs no memory
    if (process_ == 0) {
      execlp("openocd", "openocd", "-l", log_.c_str(), "-f", QORVIO_SOURCE_DIR "/rtl/cosim/openocd.cfg", "-c",
             ports_.c_str(), nullptr);
      _exit(127);
    }
    for (int tries = 0; tries < 400 && !answers(); ++tries)
      std::this_thread::sleep_for(std::chrono::milliseconds(25));
    EXPECT_TRUE(answers());
  }
  void kill(int with) {
    ::kill(process_, with);
    if (with == SIGKILL) waitpid(process_, nullptr, 0);
  }

 private:
  bool answers() const {
    try {
      return QorRT::openCable(url().c_str()) != nullptr;
    } catch (const std::runtime_error&) {
      return false;
    }
  }

  std::string boardPort_, port_, ports_;
  std::string log_ = testing::TempDir() + "openocd_" + std::to_string(getpid()) + ".log";
  pid_t process_ = -1;
};

TEST(OpenOcdServer, MayHangOrDieAndComeBackWithinASession) {
  ServedBoard served;
  OpenOcd server(served.port());
  Board board(server.url());
  VioCore core(board, {0, 1, 0});
  core.write({{"async_out_data", "00"}});
  core.read();
  core.write({{"async_out_data", "5A"}});
  TextMap values, *map = &values;
  const auto said = [&] {
    EXPECT_EQ(QorVIO_readValues(board.session, core.ref, &map), failed);
    return placeless(board.takeMessages());
  };
  const std::string where = "100 device 0, user chain 1, core 0: HOST:PORT ";
  server.kill(SIGSTOP);
  EXPECT_THAT(said(), ElementsAre(where + "gave no answer within 1.1 s"));
  server.kill(SIGCONT);
  values = core.read();
  EXPECT_EQ(values["async_in_data.activity_up"], "5A");  // even if the hanging read was carried out after all
  server.kill(SIGKILL);
  EXPECT_THAT(said(), ElementsAre(where + "gave no answer, then closed the connection"));
  EXPECT_THAT(said(), ElementsAre(where + "cannot be reached: Connection refused"));
  server.start();
  core.write({{"async_out_data", "A7"}});
  EXPECT_EQ(core.read()["async_in_data"], "A7");
}

TEST(OpenOcdServer, LogsNoScanAndIsAsLoudAsBefore) {
  ServedBoard served;
  OpenOcd server(served.port());
  server.ask("debug_level 1");
  {
    Board one(server.url()), other(server.url());
    for (Board* board : {&one, &other, &one}) VioCore(*board, {0, 1, 0}).read();
    one.close();
    VioCore(other, {0, 1, 0}).read();
  }
  EXPECT_EQ(server.ask("debug_level"), "debug_level: 1\n");
  EXPECT_THAT(server.log(), testing::Not(testing::HasSubstr("ok ")));
}

TEST(OpenOcdServer, KeepsTheInstructionOfAnotherClientWhenACableIsOpened) {
  ServedBoard served;
  OpenOcd server(served.port());
  server.ask("irscan fpga.tap 2");
  const Board board(server.url());
  EXPECT_EQ(server.ask("drscan fpga.tap 8 0"), "01");  // a hub's hello
}

// What a cable says that cannot be opened.
std::string refusal(const std::string& url, QorRT::StopFunction stop = {}) {
  try {
    QorRT::openCable(url.c_str(), std::move(stop));
  } catch (const std::exception& error) {
    return placeless({error.what()}).front();
  }
  return "nothing";
}

std::string written(const std::string& name, const std::string& text) {
  std::string path = testing::TempDir() + name;
  std::ofstream(path) << text;
  return path;
}

TEST(OpenOcdServer, IsHeldAgainstTheChainAndTheBoardFile) {
  ServedBoard served;
  setenv("QORVIO_BOARD_PORT", served.port().c_str(), 1);
  const std::string good = QORVIO_SOURCE_DIR "/rtl/cosim/openocd.cfg";
  const std::string taps = "transport select jtag\njtag newtap fpga tap -irlen 6 -expected-id 0x0A5F1093\n";
  const std::string adapter =
      "adapter driver remote_bitbang\nremote_bitbang host 127.0.0.1\nremote_bitbang port " + served.port() +
      "\n" + taps;
  const std::string cpld = "jtag newtap cpld tap -irlen 8 -expected-id 0x";
  const std::pair<std::string, std::string> refused[] = {
      {"?config=missing.cfg",
       "openocd has ended; it says: couldn't read file \"missing.cfg\": No such file or directory"},
      {"?config=" +
           written("nobody.cfg",
                   "adapter driver remote_bitbang\nremote_bitbang host 127.0.0.1\nremote_bitbang port 1\n" +
                       taps),
       "openocd has ended; it says: "},
      {"?config=" + written("extra.cfg", adapter),
       "the chain has a device that the server's configuration does not name: auto0.tap, IDCODE 1234567B, an "
       "IR "
       "of 8 bits by its capture"},
      {"?config=" + written("longer.cfg", std::regex_replace(adapter, std::regex("irlen 6"), "irlen 7") +
                                              cpld + "1234567B"),
       "openocd does not trust the chain; it says: cpld.tap: IR capture error; saw 0x80 not 0x1"},
      {"?config=" + written("other.cfg", adapter + cpld + "1234567D"),
       "the TAP cpld.tap has the IDCODE 1234567B, not 1234567D"},
      {"?config=" + good + "&board=" + written("tap.toml", "[[device]]\ntap = \"asic.tap\"\n[[device]]\n"),
       "the server has the TAPs fpga.tap, cpld.tap, the one nearest to TDO first; the board file names "
       "asic.tap "
       "as device 0"},
      {"?config=" + good + "&board=" + written("one.toml", "[[device]]\n"),
       "the chain has 2 devices, the board file says 1"},
      {"127.0.0.1:1", "HOST:PORT cannot be reached: Connection refused"},
      {"?timeout=1",
       "the cable URL \"openocd:?timeout=1\" must name a server, HOST:PORT, or a configuration to start one, "
       "?config=FILE"},
  };
  for (const auto& [rest, said] : refused) EXPECT_THAT(refusal("openocd:" + rest), testing::StartsWith(said));
  EXPECT_EQ(refusal("openocd:?config=" + good), "nothing");
}

/// A server that nobody should trust: to whoever connects it sends a text, again and again, with a pause between.
class BadServer {
 public:
  BadServer(std::string text, int pauseMilliseconds)
      : thread_([this, text, pauseMilliseconds] {
          const int client = accept(listener_, nullptr, nullptr);
          while (!stopped_ && (text.empty() || send(client, text.data(), text.size(), MSG_NOSIGNAL) > 0))
            std::this_thread::sleep_for(std::chrono::milliseconds(pauseMilliseconds));
          close(client);
        }) {}
  ~BadServer() {
    stopped_ = true;
    shutdown(listener_, SHUT_RDWR);
    thread_.join();
    close(listener_);
  }

  std::string place() const {
    sockaddr_in address{};
    socklen_t size = sizeof address;
    getsockname(listener_, reinterpret_cast<sockaddr*>(&address), &size);
    return "127.0.0.1:" + std::to_string(ntohs(address.sin_port));
  }

 private:
  static int listening() {
    sockaddr_in address{};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    const int listener = socket(AF_INET, SOCK_STREAM, 0);
    EXPECT_EQ(bind(listener, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
    EXPECT_EQ(listen(listener, 1), 0);
    return listener;
  }

  const int listener_ = listening();
  std::atomic<bool> stopped_{false};
  std::thread thread_;
};

std::atomic<bool> namesAreFound{false};

TEST(BadServers, AreWaitedForNoLongerThanAnExchangeMayTake) {
  const auto stopAtOnce = [] { return true; };
  const struct {
    const char *text, *kind, *options, *said;
    int pause;
    QorRT::StopFunction stop;
  } rows[] = {
      {"0", "rbb:", "?timeout=0.3", "HOST:PORT gave N of 2081 answers within 0.6 s", 20, {}},
      {"x", "openocd:", "?timeout=0.3", "HOST:PORT gave no answer within 0.3 s", 20, {}},
      {"", "rbb:", "?timeout=60", "HOST:PORT gave 0 of 2081 answers before the host stopped the wait", 20,
       stopAtOnce},
      {"", "openocd:", "?timeout=60", "HOST:PORT gave no answer before the host stopped the wait", 20,
       stopAtOnce},
      {"0123456789", "openocd:", "?timeout=20", "HOST:PORT answered more than 65536 bytes", 0, {}},
      {"0123456789", "rbb:", "?timeout=20", "HOST:PORT gave more answers than the 2081 that were due", 0, {}},
  };
  for (const auto& each : rows) {
    const BadServer server(each.text, each.pause);
    const auto begin = std::chrono::steady_clock::now();
    EXPECT_EQ(refusal(each.kind + server.place() + each.options, each.stop), each.said);
    EXPECT_LT(std::chrono::steady_clock::now() - begin, std::chrono::seconds(15)) << each.said;
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

TEST(OwnOpenOcd, HasNothingOfItsHostAndEndsThoughACopyOfThatLives) {
  ServedBoard served;
  setenv("QORVIO_BOARD_PORT", served.port().c_str(), 1);
  const std::size_t before = children().size();
  std::optional<Board> board("openocd:?config=" QORVIO_SOURCE_DIR "/rtl/cosim/openocd.cfg");
  ASSERT_EQ(children().size(), before + 1);
  const std::string openOcd = children().back();
  std::set<std::string> descriptors;
  for (const auto& each : std::filesystem::directory_iterator("/proc/" + openOcd + "/fd"))
    descriptors.insert(each.path().filename());
  EXPECT_THAT(descriptors, ElementsAre("0", "1", "2", "3"));  // the last is its own connection to the board
  const pid_t copy = fork();
  if (copy == 0) {
    pause();
    _exit(0);
  }
  const auto begin = std::chrono::steady_clock::now();
  board.reset();
  EXPECT_LT(std::chrono::steady_clock::now() - begin, std::chrono::milliseconds(900));
  EXPECT_FALSE(std::filesystem::exists("/proc/" + openOcd));  // not even a zombie
  ::kill(copy, SIGKILL);
  waitpid(copy, nullptr, 0);
}

TEST(Cables, TakeNoStandardStream) {
  ServedBoard served;
  setenv("QORVIO_BOARD_PORT", served.port().c_str(), 1);
  for (const std::string& url :
       {"rbb:127.0.0.1:" + served.port(),
        std::string("openocd:?config=" QORVIO_SOURCE_DIR "/rtl/cosim/openocd.cfg")}) {
    int kept[3] = {dup(0), dup(1), dup(2)};
    for (int each = 0; each < 3; ++each) close(each);
    std::string taken;
    {
      Board board(url);
      VioCore(board, {0, 1, 0}).read();
      struct stat status {};
      for (int each = 0; each < 3; ++each)
        if (fstat(each, &status) == 0 && !S_ISCHR(status.st_mode) && (status.st_mode & S_IFMT) != 0)
          taken += std::to_string(each);
    }
    for (int each = 0; each < 3; ++each) {
      dup2(kept[each], each);
      close(kept[each]);
    }
    EXPECT_EQ(taken, "") << url;
  }
}

// Only as long as nothing went wrong: the chain has no other way back to the instruction.
TEST(ChainsOfOurOwn, SelectAnInstructionOnce) {
  ServedBoard served;
  setenv("QORVIO_BOARD_PORT", served.port().c_str(), 1);
  for (const std::string& url :
       {"rbb:127.0.0.1:" + served.port(),
        std::string("openocd:?config=" QORVIO_SOURCE_DIR "/rtl/cosim/openocd.cfg")}) {
    const auto cable = QorRT::openCable(url.c_str());
    const auto hasIrScan = [&](unsigned device, unsigned userChain, bool always) {
      served.pins.writes = 0;
      cable->scanIr(device, userChain, always);
      cable->scanDr(device, {1}, 8, true);
      cable->flush();
      return served.pins.writes > 2 * (9 + 14);  // both devices' bits, and the walks of one scan or two
    };
    EXPECT_TRUE(hasIrScan(0, 1, false)) << url;
    EXPECT_FALSE(hasIrScan(0, 1, false)) << url;
    EXPECT_TRUE(hasIrScan(0, 1, true)) << url;
    EXPECT_TRUE(hasIrScan(0, 2, false)) << url;
    EXPECT_TRUE(hasIrScan(1, 2, false)) << url;
  }
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

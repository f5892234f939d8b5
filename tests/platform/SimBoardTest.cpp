// Boards: devices on the chain, the builder, board files.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdio>
#include <fstream>
#include <functional>

#include "tests/platform/SimHost.h"
#include "tests/platform/ThrownBy.h"

namespace {

using qorsim::chain;
using qorsim::ChainBuilder;
using qorsim::otherCore;
using qorsim::vio;

unsigned coreType(qorsim::SimCable& cable, unsigned device, unsigned userChain, unsigned core) {
  const std::string word = SimHost(cable, device, userChain, core).send(0, 1, 128);
  return static_cast<unsigned>(std::stoul(word.substr(3 + 112, 8), nullptr, 2));
}

TEST(SimBoard, reachesTheDeviceAtEveryPosition) {
  for (unsigned count = 1; count <= 10; count += 3) {
    ChainBuilder board = chain();
    for (unsigned i = 0; i < count; ++i)
      board.device(i % 2).irLength(4 + i).core(i % 4 + 1, i, otherCore(100 + i));
    const auto cable = board.cable();
    for (unsigned i = 0; i < count; ++i) EXPECT_EQ(coreType(*cable, i, i % 4 + 1, i), 100 + i);
  }
}

TEST(SimBoard, startsWithIdcodeSelected) {
  const auto with = chain().device(0x0A5F1093).cable(), without = chain().device().cable();
  const std::size_t scan = with->scanDr(0, {255, 255, 255, 255, 15}, 36, true);
  EXPECT_EQ(with->captured(scan), (std::vector<unsigned char>{0x93, 0x10, 0x5F, 0x0A, 0x0F}));
  const std::size_t other = without->scanDr(0, {255}, 8, true);
  EXPECT_EQ(without->captured(other), (std::vector<unsigned char>{0xFE}));
}

TEST(SimBoard, countsExchangesAndScans) {
  const auto cable = chain().device().core(1, 0, vio()).cable();
  cable->scanIr(0, 1);
  cable->scanDr(0, {0}, 8, false);
  cable->idle(8);
  cable->flush();
  cable->flush();
  EXPECT_EQ(cable->exchanges(), 1u);
  EXPECT_EQ(cable->scans(), 2u);
}

TEST(SimBoard, builderNamesWhatIsWrong) {
  const auto place = [](unsigned userChain, unsigned index, const qorsim::CoreSpec& core) {
    return [=] { chain().device().device().core(1, 2, vio()).core(userChain, index, core); };
  };
  const std::pair<std::function<void()>, std::string> cases[] = {
      {[] { chain().cable(); }, "chain: device is missing: a chain has at least one"},
      {[] { chain().core(1, 0, vio()); }, "chain: core comes before any device"},
      {[] { chain().device().irLength(3); }, "device 0: ir_length must be 4 to 32, is 3"},
      {place(0, 0, vio()), "device 1, user chain 0, core 0: user_chain must be 1 to 4, is 0"},
      {place(5, 0, vio()), "device 1, user chain 5, core 0: user_chain must be 1 to 4, is 5"},
      {place(1, 16, vio()), "device 1, user chain 1, core 16: index must be 0 to 15, is 16"},
      {place(1, 2, vio()), "device 1, user chain 1, core 2: index is taken on this user chain, is 2"},
      {place(2, 2, vio().version(6, 1).asyncOut(256)),
       "device 1, user chain 2, core 2: async_out must be 0 to 255 in version 6.1, is 256"},
      {place(2, 2, vio().version(9, 0).cgVersion(1, 0, 0)),
       "device 1, user chain 2, core 2: cg_version is for versions from 10.0 on only, version is 9.0"},
      {place(2, 2, otherCore(256)), "device 1, user chain 2, core 2: type must be 0 to 255, is 256"},
      {place(2, 2, otherCore(7).syncOut(1)),
       "device 1, user chain 2, core 2: sync_out is for VIO cores only, is 1"},
      {place(2, 2, otherCore(7).design(qorsim::idle())),
       "device 1, user chain 2, core 2: design is for VIO cores only"},
  };
  for (const auto& [build, message] : cases) EXPECT_EQ(thrownBy(build), "logic: " + message);
}

TEST(SimBoard, readsTheExampleFile) {
  const auto cable = qorsim::boardFile(QORVIO_SOURCE_DIR "/examples/boards/lab.toml").cable();
  ASSERT_EQ(cable->devices().size(), 3u);
  EXPECT_EQ(cable->devices()[1].name, "bridge");
  EXPECT_EQ(cable->devices()[1].idcode, 0u);
  EXPECT_EQ(cable->devices()[2].irLength, 8u);
  EXPECT_EQ(coreType(*cable, 0, 1, 0), 9u);
  EXPECT_EQ(coreType(*cable, 0, 1, 1), 7u);
  // The answers before have made 10 clocks; the next one takes the snapshot.
  const std::string records = SimHost(*cable, 2, 2, 3).send(3, 1, 160).substr(3);
  std::string values;
  for (std::size_t i = 0; i < 64; i += 4) values += records[i];
  EXPECT_EQ(values, "1101000000000000");
}

class BoardFiles : public testing::Test {
 protected:
  ~BoardFiles() override { std::remove(path_.c_str()); }

  // The message for a file with this text, without the path before it.
  std::string messageFor(const std::string& text) {
    std::ofstream(path_) << text;
    const std::string message = thrownBy([this] { qorsim::boardFile(path_); }), start = "runtime: " + path_;
    return message.rfind(start, 0) == 0 ? message.substr(start.size()) : message;
  }

  const std::string path_ = testing::TempDir() + "sim_board_" + std::to_string(::getpid()) + ".toml";
};

TEST_F(BoardFiles, errorsSayWhereAndWhat) {
  const std::string core = "[[device]]\n[[device.core]]\nuser_chain=1\nindex=0\n";
  const std::string vioCore = core + "type=\"vio\"\n";
  const std::pair<std::string, std::string> cases[] = {
      {"", ":1: device: is missing"},
      {"device=[]", ":1: device: must be an array of tables, is an array"},
      {"tcks_per_clock=-1\n[[device]]", ":1: tcks_per_clock: must be 0 to 4294967295, is -1"},
      {"[[device]]\nidcode=\"1\"", ":2: device[0].idcode: must be a whole number, is \"1\""},
      {"[[device]]\nuser_opcodes=[62, 63]", ":2: device[0].user_opcodes: must be 0 to 62, is 63"},
      {"[[device]]\nname=1", ":2: device[0].name: must be a text, is 1"},
      {"colour=6\n[[device]]", ":1: colour: is no key of a board file"},
      {core, ":2: device[0].core[0].type: is missing"},
      {"[[device]]\n[[device.core]]\ntype=7\nindex=0", ":2: device[0].core[0].user_chain: is missing"},
      {core + "type=\"ila\"", ":5: device[0].core[0].type: must be \"vio\" or a number, is \"ila\""},
      {core + "type=7\nasync_in=8", ":6: device[0].core[0].async_in: is for VIO cores only, is 8"},
      {vioCore + "sync_in=1.5",
       ":6: device[0].core[0].sync_in: must be a whole number, is a number with a fraction"},
      {vioCore + "version=\"6.1\"\nsync_out=256",
       ":7: device[0].core[0].sync_out: must be 0 to 255 in version 6.1, is 256"},
      {vioCore + "version=\"10.0.1\"",
       ":6: device[0].core[0].version: must be 2 numbers with dots between, is \"10.0.1\""},
      {vioCore + "version=\"256.0\"", ":6: device[0].core[0].version: must be 0 to 255, is 256"},
      {vioCore + "design=\"blinky\"",
       ":6: device[0].core[0].design: must be \"loopback\", \"counter\", \"toggle\" or \"idle\", is "
       "\"blinky\""},
      {vioCore + "[[device.core]]\nuser_chain=1\nindex=0\ntype=7",
       ":8: device[0].core[1].index: is taken on this user chain, is 0"},
  };
  for (const auto& [text, message] : cases) EXPECT_EQ(messageFor(text), message) << text;
}

TEST_F(BoardFiles, areBounded) {
  const auto many = [](const std::string& text, unsigned count) {
    std::string all;
    while (count-- > 0) all += text;
    return all;
  };
  const std::string device = "[[device]]\nname=", deep = ": is nested more than 16 levels deep";
  const std::pair<std::string, std::string> cases[] = {
      {many("a.", 16) + "a=1", ":1: device: is missing"},
      {many("a.", 17) + "a=1", ":1" + deep},
      {"[" + many("a.", 31000) + "a]", ":1" + deep},
      {"device=" + many("{a=", 31000), ":1" + deep},
      {device + "\"\"\"\n\"\\\"\"\"\"\"\n" + many("a.", 31000) + "a=1", ":4" + deep},
      {device + "'''\n'''''\nidcode=" + many("[", 31000), ":4" + deep},
      {device + "'\\' # \"\ncore=" + many("[", 31000), ":3" + deep},
      {device + "'''" + many("[.", 31000) + "'''", "nothing"},
      {device + "\"\\\"" + many("[.", 31000) + "\" #" + many("{", 31000), "nothing"},
      {std::string((1 << 20) + 1, '\n'), ": is larger than 1048576 bytes"},
  };
  for (const auto& [text, message] : cases) EXPECT_EQ(messageFor(text), message) << text.substr(0, 80);
}

TEST_F(BoardFiles, syntaxErrorsHaveALine) {
  EXPECT_THAT(messageFor("[[device]]\nname=\n"), testing::StartsWith(":2: Error while parsing key-value"));
  EXPECT_THAT(messageFor("[[device]]\nname=\"a\"\nname=\"b\"\n"), testing::StartsWith(":3: Error while"));
}

TEST_F(BoardFiles, filesThatCannotBeRead) {
  EXPECT_EQ(thrownBy([] { qorsim::boardFile("no/such.toml"); }),
            "runtime: no/such.toml: cannot be opened: No such file or directory");
  EXPECT_EQ(thrownBy([] { qorsim::boardFile("/"); }), "runtime: /: cannot be opened: it is a directory");
  ASSERT_EQ(::mkfifo(path_.c_str(), 0600), 0);
  EXPECT_EQ(thrownBy([this] { qorsim::boardFile(path_); }),
            "runtime: " + path_ + ": cannot be opened: it is not a regular file");
}

TEST(SimBoard, readsTheFileOfARealChain) {
  EXPECT_EQ(qorsim::boardFile(QORVIO_SOURCE_DIR "/examples/adapters/board.toml").cable()->devices()[0].idcode,
            0x0A5F1093u);
}

}  // namespace

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "QorCore.h"
#include "tests/platform/ScriptedCable.h"

namespace {

using QorRT::Qor_ByteBuffer;
using QorRT::Qor_CoreComm;
using Lines = std::vector<std::string>;

const std::string writeText = "00 1 0 01 0 00000016 100004\n00 1 0 02 0 00000004 0";
const std::string readText = "00 1 0 03 1 00000020 0\n00 1 0 04 1 00000004 0";
const Bits records = bitsOf(0xCD0A, 16);

/// A session with the core of the worked example: AO 2, SO 1, AI 1, SI 2.
class Sequencer : public testing::Test {
 protected:
  void answer(const std::vector<Bits>& bits) {
    script.answers.insert(script.answers.end(), bits.begin(), bits.end());
  }

  void write() { Qor_CoreComm::commandSequence(session.handle, writeText, nullptr, 0, nullptr); }

  std::string read(const std::string& text = readText, unsigned bytes = 5) {
    Qor_ByteBuffer result(bytes, 0, 0), digits;
    Qor_CoreComm::commandSequence(session.handle, text, result.uPtr(), bytes * 8, nullptr);
    result.bin2HexString(0, digits);
    return digits.ptr();
  }

  ScriptedSession session;
  Script& script = *session.script;
};

TEST_F(Sequencer, RunsTheWorkedExampleBitForBit) {
  QOR_CORE_INFO info{};
  Qor_ByteBuffer word(154, 10, 10), digits;
  answer({bitsOfHex("E2E0000010002000200010000100000A0951A000", 160)});
  Qor_CoreComm::getCoreStatus(session.handle, {0, 1, 0}, &info, word, 154 * 8);
  word.bin2HexString(0, digits);
  EXPECT_EQ(digits.ptr(), std::string(276, '0') + "000010002000200010000100000A0951");
  EXPECT_EQ(info.manufacturer_id, 0x51U);
  EXPECT_EQ(info.core_type, 9U);
  EXPECT_EQ(info.core_major_version, 10U);
  answer({bitsOfHex("897EA020", 32)});
  write();
  answer({bitsOfHex("5F72CD0AA030", 48), bitsOfHex("EC2BA040", 32)});
  EXPECT_EQ(read(), "005F72CD0A");
  EXPECT_EQ(script.log, Lines({"ir 0 1", "dr 0 26 3C1E001",
                               "idle 8", "dr 0 160 07F7F07FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFF",
                               "idle 8", "run",
                               "ir 0 1", "dr 0 47 623F90400011",
                               "idle 8", "dr 0 32 07F7F07F",
                               "idle 8", "run",
                               "ir 0 1", "dr 0 26 307ECC1",
                               "idle 8", "dr 0 48 B27C407FFFFF",
                               "idle 8", "dr 0 32 07F7F07F",
                               "idle 8", "run"}));
}

std::string hex8(std::size_t value) {
  return hexOf(bitsOf(static_cast<unsigned>(value), 32));
}

TEST_F(Sequencer, BuildsAndChecksFramesOfEveryLength) {
  const auto dr = [](const Bits& scan) { return "dr 0 " + std::to_string(scan.size()) + " " + hexOf(scan); };
  for (const unsigned bits : {0U, 1U, 7U, 8U, 9U, 55U, 63U, 64U, 65U, 1001U, 65600U}) {
    script.log.clear();
    const Bits data = noise(bits);
    answer({answerOf(0xA020), answerOf(0xA030, data), answerOf(0xA040)});
    const std::string write = "00 1 0 01 0 " + hex8(bits + 1) + " " + hexOf(data + "0");
    const std::string read = "\n00 1 0 02 0 00000004 0\n00 1 0 03 1 " + hex8(bits + 16) + " 0";
    const unsigned bytes = (bits + 16 + 7) / 8 + 1;
    Bits returned = answerOf(0xA030, data).substr(16);
    returned.resize(bytes * 8, '0');
    EXPECT_EQ(this->read(write + read + "\n00 1 0 04 1 00000004 0", bytes), hexOf(returned)) << bits;
    const Bits last = frameScan(0x0F, "", 32);
    EXPECT_EQ(script.logged("dr"),
              Lines({dr(frameScan(0x02, data, bits + 26)), dr(last), dr(frameScan(0x03, "", 26)),
                     dr(frameScan(0x04, "", 32 + bits)), dr(last)}))
        << bits;
  }
}

TEST_F(Sequencer, SaysWhatItSawInThePlaceOfAnAnswer) {
  Bits flipped = answerOf(0xA030, records);
  flipped[20] = flipped[20] == '0' ? '1' : '0';
  const Bits good = answerOf(0xA030, records);
  struct {
    std::vector<Bits> answers;
    const char* thrown;
  } const cases[] = {
      {{Bits(48, '0')}, "no debug hub answers, TDO is all zeros"},
      {{Bits(48, '1')}, "no debug hub answers, TDO is all ones"},
      {{Bits(47, '0') + "1"}, "no debug hub answers, TDO is another pattern, head 0000"},
      {{flipped}, "the CRC of the answer does not hold over 16 data bits"},
      {{bitsOf(0xA034, 16)}, "the CRC of the answer does not hold over 16 data bits"},
      {{good, bitsOf(0xA040, 16)}, "the CRC of the answer does not hold over 0 data bits"},
      {{answerOf(0xA0F1)}, "the frame was rejected"},
      {{answerOf(0xA130, records)}, "the answer is to another frame, head A130"},
      {{good, answerOf(0xA030)}, "the answer is to another frame, head A030"},
      {{answerOf(0xA032)}, "no such core, or it cannot be read"},
  };
  for (const auto& c : cases) {
    ScriptedSession fresh;
    fresh.script->answers.assign(c.answers.begin(), c.answers.end());
    std::vector<unsigned char> result(5, 0x5A);
    const auto call = [&] {
      Qor_CoreComm::commandSequence(fresh.handle, readText, result.data(), 40, nullptr);
    };
    EXPECT_EQ(thrownBy(call), std::string("runtime: device 0, user chain 1, core 0: ") + c.thrown);
    EXPECT_EQ(result, std::vector<unsigned char>(5, 0x5A)) << c.thrown;
    EXPECT_EQ(fresh.script->logged("run").size(), 1U) << c.thrown;
  }
  script.answers = {answerOf(0xA022)};
  EXPECT_EQ(thrownBy([this] { write(); }),
            "runtime: device 0, user chain 1, core 0: no such core, or it cannot be written");
  script.failure = "the link is dead";
  EXPECT_EQ(thrownBy([this] { read(); }), "runtime: device 0, user chain 1, core 0: the link is dead");
}

const std::string dr02 = "dr 0 47 623F90400011", dr03 = "dr 0 26 307ECC1", dr0F = "dr 0 32 07F7F07F";
const std::string dr04 = "dr 0 48 B27C407FFFFF";
const std::string first0F = "dr 0 26 " + hexOf(frameScan(0x0F, "", 26));
const std::string dr05 = "dr 0 26 " + hexOf(frameScan(0x05, "", 26));

TEST_F(Sequencer, SendsARefusedWriteAgainButNeverOneThatWasTaken) {
  answer({answerOf(0xA0FC), answerOf(0xA028), answerOf(0xA0F8), answerOf(0xA0F0)});
  write();
  EXPECT_EQ(script.logged("dr"), Lines({dr02, dr0F, dr02, dr0F, first0F, dr0F, first0F, dr0F}));
}

TEST_F(Sequencer, RepeatsAPendingReadSoThatNoActivityIsLost) {
  const Bits pending = answerOf(0xA038, noise(16)), refused = answerOf(0xA0F4);
  answer({pending, Bits(), refused, Bits(), answerOf(0xA050, records), answerOf(0xA048)});
  answer({answerOf(0xA050, records), answerOf(0xA040)});
  EXPECT_EQ(read().substr(6), "CD0A");
  EXPECT_EQ(script.logged("dr"),
            Lines({dr03, dr04, dr0F, dr05, dr04, dr0F, dr05, dr04, dr0F, dr05, dr04, dr0F}));
}

TEST_F(Sequencer, GivesUpOnADesignClockThatStandsStill) {
  const std::string stopped = "runtime: device 0, user chain 1, core 0: design clock stopped";
  answer({answerOf(0xA028), answerOf(0xA0F8), answerOf(0xA0F8), answerOf(0xA0F8), answerOf(0xA0F8)});
  EXPECT_EQ(thrownBy([this] { write(); }), stopped);
  EXPECT_EQ(script.logged("dr 0 47"), Lines({dr02}));
  EXPECT_EQ(script.logged("ir").size(), 5U);
  EXPECT_EQ(script.logged("idle"), Lines({"idle 8", "idle 8", "idle 64", "idle 64", "idle 512", "idle 512",
                                          "idle 4096", "idle 4096", "idle 32768", "idle 32768"}));
}

TEST_F(Sequencer, TakesAReadForFailedWhenALaterPairOfItsTextFails) {
  const std::string otherCore = "\n01 2 0 03 1 00000020 0\n01 2 0 04 1 00000004 0";
  answer({answerOf(0xA030, records), answerOf(0xA040), answerOf(0xA030, records), answerOf(0xA040)});
  EXPECT_EQ(thrownBy([&] { read(readText + "\n" + readText + otherCore, 15); }),
            "runtime: device 1, user chain 2, core 0: no debug hub answers, TDO is all zeros");
  answer({answerOf(0xA0F0), answerOf(0xA050, records), answerOf(0xA040), answerOf(0xA030, records),
          answerOf(0xA040)});
  EXPECT_EQ(read(readText + "\n" + readText, 10).substr(6, 4), "CD0A");
  EXPECT_EQ(script.logged("dr 0 26"), Lines({dr03, dr03, first0F, dr05, dr03}));
  EXPECT_EQ(script.logged("ir 1"), Lines({"ir 1 2"}));
}

std::vector<std::string> progressSeen;
unsigned abortAt;

QOR_PROGRESS_RETURN noteProgress(unsigned, unsigned done, unsigned count, QOR_PROGRESS_STATUS status) {
  progressSeen.push_back(std::to_string(done) + "/" + std::to_string(count) +
                         (status == QOR_PROGRESS_DONE ? " done" : ""));
  return done == abortAt ? QOR_PROGRESS_ABORT : QOR_PROGRESS_CONTINUE;
}

TEST_F(Sequencer, TellsItsProgressAndCanBeAborted) {
  const auto twice = [this] {
    progressSeen.clear();
    Qor_CoreComm::commandSequence(session.handle, writeText + "\n" + writeText, nullptr, 0, noteProgress);
  };
  abortAt = 3;
  answer({answerOf(0xA020), answerOf(0xA020)});
  twice();
  EXPECT_EQ(progressSeen, Lines({"0/2", "1/2", "2/2 done"}));
  abortAt = 1;
  answer({answerOf(0xA020)});
  EXPECT_EQ(thrownBy(twice), "logic: Qor abort command");
  EXPECT_EQ(script.logged("run").size(), 3U);
}

TEST_F(Sequencer, LeavesTheStatusZeroWhenThereIsNoCoreOrNoAnswer) {
  const auto status = [this](unsigned core) {
    QOR_CORE_INFO info{1, 2, 3, 4, 5};
    std::vector<unsigned char> word(17, 0xFF);
    unsigned found = 9;
    const std::string thrown = thrownBy([&] {
      found = QorCore_getCoreStatus(session.handle, {0, 1, core}, &info, word.data(), 132);
    });
    EXPECT_EQ(word, std::vector<unsigned char>(17)) << thrown;
    EXPECT_EQ(info.manufacturer_id + info.core_type + info.core_major_version + info.core_minor_version +
                  info.core_revision,
              0U);
    return thrown + ", " + std::to_string(found);
  };
  answer({answerOf(0xA002)});
  EXPECT_EQ(status(0), "nothing, 1");
  EXPECT_EQ(status(0), "runtime: device 0, user chain 1, core 0: no debug hub answers, TDO is all zeros, 9");
  EXPECT_EQ(status(16), "logic: the core index 16 is above 15, 9");
}

TEST_F(Sequencer, DeliversAsManyStatusBitsAsItIsAskedFor) {
  QOR_CORE_INFO info{};
  std::vector<unsigned char> word(3, 0xFF);
  const auto status = [&](unsigned char* into, unsigned bits) {
    return QorCore_getCoreStatus(session.handle, {0, 1, 0}, &info, into, bits);
  };
  answer({answerOf(0xA000, Bits(128, '1')), answerOf(0xA000, Bits(128, '1'))});
  EXPECT_EQ(status(word.data(), 12), 0U);
  EXPECT_EQ(word, std::vector<unsigned char>({0xFF, 0x0F, 0xFF}));
  EXPECT_EQ(status(nullptr, 0), 0U);
  EXPECT_EQ(info.core_revision, 255U);
  EXPECT_EQ(thrownBy([&] { status(nullptr, 8); }), "logic: the status word buffer is null");
}

TEST_F(Sequencer, RefusesNullRecordsAndResultsOfTheWrongSize) {
  Qor_ByteBuffer word(16, 0, 0);
  unsigned char result[5];
  const unsigned handle = session.handle;
  const auto run = [handle](const std::string& text, unsigned char* into, unsigned bits) {
    return thrownBy([&] { Qor_CoreComm::commandSequence(handle, text, into, bits, nullptr); });
  };
  EXPECT_EQ(thrownBy([&] {
              Qor_CoreComm::getCoreStatus(handle, {0, 1, 0}, nullptr, word, 128);
            }),
            "logic: the core information record of a status read is null");
  EXPECT_EQ(run(readText, result, 32), "logic: the result has 32 bits, but the command text returns 40");
  EXPECT_EQ(run(readText, nullptr, 40), "logic: the result of a command text that reads is null");
  EXPECT_EQ(run(writeText, result, 8), "logic: the result has 8 bits, but the command text returns 0");
  EXPECT_EQ(script.log, Lines());
}

}  // namespace

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "QorCore.h"
#include "platform/core/QorCore_Host.h"
#include "platform/core/Qor_HubAccess.h"
#include "tests/platform/ScriptedCable.h"

namespace {

using QorRT::Qor_ByteBuffer;
using QorRT::Qor_CoreComm;
using Lines = std::vector<std::string>;

const Bits records = bitsOf(0xCD0A, 16);
const Reply good{}, noSuchCore{0xA2}, silent{0}, slow{0xA0, {}, 1000}, whole{0xA0, records},
    word{0xA0, Bits(128, '1')};

Reply waiting(std::size_t wait) {
  return {0xA0, records, wait};
}
Reply atHeader(unsigned head) {  // the payload is not taken
  return {head, {}, 0, false};
}
Reply flipped(Reply reply) {
  reply.isFlipped = true;
  return reply;
}

// One device, fixed tags: each scan as one number.
TEST(WorkedExample, HoldsBitForBit) {
  const auto script = std::make_shared<Script>();
  ScriptedCable cable(script, 1);
  QorRT::Qor_LinkRecord record;
  QorRT::Qor_CoreLink link(0x001);
  link.knowsWriteTags = true;
  QorRT::Qor_HubAccess hub(cable, record, link, {0, 1, 0});
  script->answers = {bitsOfHex("00E23A6595000010002000200010000100000A0951D0000000000000001", 236),
                     bitsOfHex("0010BBCD327A00000000000000000000000000001", 161),
                     bitsOfHex("00AC9466D8CD0AD0000000000000001", 124)};
  QorRT::Qor_StatusWord status{};
  EXPECT_TRUE(hub.readStatus(status));
  EXPECT_EQ(hexOf(bitsOfBytes({status.begin(), status.end()}, 128)), "000010002000200010000100000A0951");
  hub.write({0x04, 0x00, 0x10}, 21, false);
  const QorRT::Qor_ReadResult read = hub.read(16, false);
  EXPECT_EQ(hexOf(bitsOfBytes(read.bits, 32)), "66D8CD0A");
  EXPECT_EQ(read.flags, 0U);
  EXPECT_EQ(script->log,
            Lines({"ir 0 1", "dr 0 236 FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFEB263E808004401", "run",
                   "ir 0 1", "dr 0 161 1FFFFFFFFFFFFDA199DEA400012BC70B9B0004409", "run", "ir 0 1",
                   "dr 0 124 FFFFFFFFFFFFFFFFEBB79116C00440D", "run"}));
}

const std::string writeText = "00 1 0 01 0 00000016 100004\n00 1 0 02 0 00000004 0";
const std::string readText = "00 1 0 03 1 00000020 0\n00 1 0 04 1 00000004 0";
const std::string where = "device 0, user chain 1, core 0: ";

/// A session with the core of the worked example: AO 2, SO 1, AI 1, SI 2; in a chain of two devices.
class Sequencer : public testing::Test {
 protected:
  void answer(const std::vector<Answer>& answers) {
    script.frames.clear();
    script.answers.assign(answers.begin(), answers.end());
  }

  std::string run(const std::string& text, unsigned char* result, unsigned bits,
                  QOR_PROGRESS_CALLBACK progress = nullptr) {
    return thrownBy([&] { Qor_CoreComm::commandSequence(session.handle, text, result, bits, progress); });
  }
  std::string write() { return run(writeText, nullptr, 0); }

  /// The digits of the result, or what was thrown.
  std::string read(const std::string& text = readText, unsigned bytes = 5) {
    Qor_ByteBuffer result(bytes, 0, 0), digits;
    const std::string thrown = run(text, result.uPtr(), bytes * 8);
    result.bin2HexString(0, digits);
    return thrown == "nothing" ? digits.ptr() : thrown;
  }

  /// The result without the digits of the CRC.
  std::string flagsAndRecords() {
    const std::string digits = read();
    return digits.size() == 10 ? digits.substr(0, 2) + digits.substr(6) : digits;
  }

  std::string status(unsigned core = 0) {
    QOR_CORE_INFO info{1, 2, 3, 4, 5};
    std::vector<unsigned char> bits(17, 0xFF);
    unsigned found = 9;
    const std::string thrown = thrownBy([&] {
      found = QorCore_getCoreStatus(session.handle, {0, 1, core}, &info, bits.data(), 132);
    });
    EXPECT_TRUE(found == 0 || (bits == std::vector<unsigned char>(17) && info.core_type == 0)) << thrown;
    return thrown + ", " + std::to_string(found);
  }

  QorJtag_Statistics statistics() const {
    QorJtag_Statistics now;
    QorJtag_session_getStatistics(session.handle, now);
    return now;
  }

  ScriptedSession session;
  Script& script = *session.script;
};

const std::string intro = "2.0 000000 /162";  // the write that marks nothing

struct Row {
  char call;  // what is called: w, r, s
  std::vector<Answer> answers;
  Lines frames;
  std::string result;
};

// What is sent for each kind of answer, within one session: tags count on, and the hub knows our tags after the first
// write.
TEST_F(Sequencer, RepeatsUnderTheSameTagWhatMayHaveBeenDone) {
  const std::string done = "nothing", found = "nothing, 0";
  const Row rows[] = {
      {'s', {flipped(word), word}, {"0.1 /237", "0.1 /237"}, found},
      {'w', {flipped(good), good, good}, {intro, intro, "2.1 100004 /162"}, done},
      {'w', {flipped(good), atHeader(0xA0)}, {"2.2 100004 /162", "A.2 100004 /162"}, done},
      {'w', {silent, good}, {"2.3 100004 /162", "A.3 100004 /162"}, done},
      {'w', {atHeader(0xA4), good}, {"2.4 100004 /162", "2.4 100004 /218"}, done},
      {'w', {slow, atHeader(0xA0)}, {"2.5 100004 /162", "A.5 100004 /218"}, done},
      {'w',
       {silent, atHeader(0xA4), atHeader(0xA0)},
       {"2.6 100004 /162", "A.6 100004 /162", "A.6 100004 /218"},
       done},
      {'r', {Reply{0xA8, records}}, {"3.1 /125"}, "08CD0A"},
      {'r', {flipped(whole), whole}, {"3.2 /125", "B.2 /125"}, "00CD0A"},
      {'r', {slow, slow, waiting(300)}, {"3.3 /125", "B.3 /181", "B.3 /629"}, "00CD0A"},
      {'r', {waiting(60)}, {"3.4 /629"}, "00CD0A"},
      {'r', {waiting(20)}, {"3.5 /629"}, "00CD0A"},
      {'r', {waiting(20)}, {"3.6 /181"}, "00CD0A"},
      {'r', {waiting(5)}, {"3.7 /181"}, "00CD0A"},
      {'r', {waiting(8)}, {"3.8 /125"}, "00CD0A"},
      {'r',
       {silent, silent, silent, silent},
       {"3.9 /125", "B.9 /125", "B.9 /125", "B.9 /125"},
       "runtime: " + where + "the hub did not answer the frame, in 4 attempts"},
      {'r', {slow, whole}, {"5.A /125", "D.A /181"}, "00CD0A"},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.frames[0]);
    answer(row.answers);
    EXPECT_EQ(row.call == 'w' ? write() : row.call == 's' ? status() : flagsAndRecords(), row.result);
    EXPECT_EQ(script.frames, row.frames);
  }
  const QorJtag_Statistics all = statistics();
  EXPECT_EQ(all.transfers, script.tags.size());
  EXPECT_EQ(all.repeatsNoHub + all.repeatsNoHead, 5U);
  EXPECT_EQ(all.repeatsBadCrc, 4U);
  EXPECT_EQ(all.repeatsSlow, 4U);
  EXPECT_EQ(all.repeatsRefused, 2U);
  EXPECT_GT(all.bits, all.transfers * 125);
  EXPECT_GT(all.nanoseconds, 0U);
}

TEST_F(Sequencer, SaysWhatItSawAtEachAttempt) {
  const Reply badCrc = flipped(whole);
  const std::string in4 = ", in 4 attempts", crc = "the CRC of the answer does not hold over 16 data bits";
  const std::string noHub = "no debug hub answers, TDO is ";
  const std::pair<std::vector<Answer>, std::string> cases[] = {
      {std::vector<Answer>(4, Bits()), noHub + "all zeros" + in4},
      {std::vector<Answer>(4, Bits(125, '1')), noHub + "all ones" + in4},
      {std::vector<Answer>(4, "01" + Bits(98, '0') + "1"), "the hub did not answer the frame" + in4},
      {std::vector<Answer>(4, Bits("0101011")), noHub + "another pattern, its first 32 bits 0000006A" + in4},
      {std::vector<Answer>(4, badCrc), crc + in4},
      {{badCrc, silent, Reply{0x50}, Bits()},
       "4 attempts: " + crc +
           "; the hub did not answer the frame; the answer begins with 50, which is no head; " + noHub +
           "all zeros"},
      {{noSuchCore}, "no such core, or it cannot be read"},
      {{Reply{0xA6}}, "two cores have this index, so the hub obeys neither"},
  };
  for (const auto& [answers, said] : cases) {
    std::vector<unsigned char> result(5, 0x5A);
    answer(answers);
    EXPECT_EQ(run(readText, result.data(), 40), "runtime: " + where + said);
    EXPECT_EQ(result, std::vector<unsigned char>(5, 0x5A)) << said;
    EXPECT_EQ(script.frames.size(), answers.size()) << said;
  }
  answer({});
  EXPECT_THROW(Qor_CoreComm::commandSequence(session.handle, writeText, nullptr, 0, nullptr),
               QorRT::Qor_NoHub);
  answer({good, atHeader(0xA2)});
  EXPECT_EQ(write(), "runtime: " + where + "no such core, or it cannot be written");
  script.failure = "the link is dead";
  EXPECT_EQ(read(), "runtime: " + where + "the link is dead");
}

TEST_F(Sequencer, FindsACoreAgainAtAnotherAddressByAMark) {
  const std::string mark = "2.0 000000 /162", look = "A.0 000000 /162";
  const auto isOne = [&] { return QorRT::isOneCore(session.handle, {0, 1, 0}, {0, 2, 0}, 21); };
  answer({good, good});
  EXPECT_EQ(write(), "nothing");
  answer({good, atHeader(0xA0), good, atHeader(0xA0)});
  EXPECT_TRUE(isOne());
  EXPECT_EQ(script.frames, Lines({mark, look, mark, look}));
  const std::size_t last = script.tags.size() - 1;
  EXPECT_TRUE(script.tags[last] == script.tags[last - 1] && script.tags[last - 2] == script.tags[last - 3]);
  answer({good, atHeader(0xA4)});
  EXPECT_FALSE(isOne());
  answer({good, good});
  EXPECT_EQ(write(), "nothing");
  EXPECT_EQ(script.frames.size(), 2U) << "the hub does not know the session's tags any more";
}

TEST_F(Sequencer, GivesUpOnADesignClockThatStandsStillAfterTwoSeconds) {
  answer(std::vector<Answer>(100, slow));
  const std::string said = read();
  EXPECT_EQ(said.substr(0, said.rfind(", ")), "runtime: " + where + "design clock stopped");
  EXPECT_EQ(script.frames[0], "3.1 /125");
  EXPECT_EQ(script.frames[2], "B.1 /629");
  EXPECT_EQ(script.frames.back(), "B.1 /629");
  EXPECT_LT(script.frames.size(), 60U);
  answer({word});
  EXPECT_EQ(status(), "nothing, 0");
  answer({whole});
  EXPECT_EQ(read().substr(6), "CD0A");
  EXPECT_EQ(script.frames, Lines({"5.2 /629"}));
}

TEST_F(Sequencer, DrawsOtherTagsAfterEightFailuresInARow) {
  for (const bool isWrite : {true, false}) {
    const auto expectDone = [&] {
      answer({isWrite ? good : whole, good});
      EXPECT_EQ(isWrite ? write() : read().substr(6), isWrite ? "nothing" : "CD0A");
    };
    expectDone();
    const unsigned before = script.tags.back() >> 4;
    for (int i = 0; i < 8; ++i) {
      EXPECT_EQ(script.tags.back() >> 4, before);
      answer({});
      EXPECT_NE(isWrite ? write() : read(), "nothing");
    }
    expectDone();
    EXPECT_NE(script.tags.back() >> 4, before);
    EXPECT_EQ(script.frames.size(), isWrite ? 2U : 1U);  // the hub must know new tags of writes first
  }
}

TEST_F(Sequencer, BuildsAndChecksFramesOfEveryLengthWithLateLinesToo) {
  std::vector<QorJtag_Hub> hubs;
  for (const unsigned bits : {1U, 7U, 8U, 9U, 55U, 63U, 64U, 65U, 1001U, 65600U}) {
    const auto late = [bits](Reply reply) {
      reply.lateTdi = bits % 3;
      reply.lateTdo = bits / 8 % 3;
      return reply;
    };
    answer({late(word), late(good), late(good), late({0xA0, noise(bits)})});
    if (bits != 1) script.answers.erase(script.answers.begin() + 1);
    EXPECT_EQ(status(), "nothing, 0");
    QorJtag_session_getHubs(session.handle, hubs);
    ASSERT_EQ(hubs.size(), 1U);
    EXPECT_EQ(hubs[0].lateTdi, bits % 3);
    EXPECT_EQ(hubs[0].lateTdo, bits / 8 % 3);
    const Bits data = noise(bits - 1) + "1";
    const std::string text = "00 1 0 01 0 " + hexOf(bitsOf(bits + 1, 32)) + " " + hexOf(data + "0") +
                             "\n00 1 0 02 0 00000004 0\n00 1 0 03 1 " + hexOf(bitsOf(bits + 16, 32)) +
                             " 0\n00 1 0 04 1 00000004 0";
    const unsigned bytes = (bits + 16 + 7) / 8 + 1;
    const std::string digits = this->read(text, bytes);
    EXPECT_EQ(bitsOfHex(digits, bytes * 8).substr(0, bits), noise(bits)) << bits;
    EXPECT_EQ(script.frames.back().substr(4), "/" + std::to_string(109 + bits + hubs[0].late()));
    EXPECT_EQ(script.frames.rbegin()[1].substr(4),
              hexOf(data) + " /" + std::to_string(141 + bits + hubs[0].late()));
  }
}

TEST_F(Sequencer, TakesAReadForFailedWhenALaterPairOfItsTextFails) {
  const std::string otherCore = "\n01 2 0 03 1 00000020 0\n01 2 0 04 1 00000004 0";
  answer({whole, whole});
  EXPECT_EQ(read(readText + "\n" + readText + otherCore, 15),
            "runtime: device 1, user chain 2, core 0: no debug hub answers, TDO is all zeros, in 4 attempts");
  answer({whole, whole});
  EXPECT_EQ(read(readText + "\n" + readText, 10).substr(6, 4), "CD0A");
  EXPECT_EQ(script.frames, Lines({"5.3 /125", "3.4 /125"}));
}

Lines progressSeen;
unsigned abortAt;

QOR_PROGRESS_RETURN noteProgress(unsigned, unsigned done, unsigned count, QOR_PROGRESS_STATUS status) {
  progressSeen.push_back(std::to_string(done) + "/" + std::to_string(count) +
                         (status == QOR_PROGRESS_DONE ? " done" : ""));
  return done == abortAt ? QOR_PROGRESS_ABORT : QOR_PROGRESS_CONTINUE;
}

TEST_F(Sequencer, TellsItsProgressAndCanBeAborted) {
  const std::string twice = writeText + "\n" + writeText;
  abortAt = 3;
  answer({good, good, good});
  EXPECT_EQ(run(twice, nullptr, 0, noteProgress), "nothing");
  EXPECT_EQ(progressSeen, Lines({"0/2", "1/2", "2/2 done"}));
  abortAt = 1;
  answer({good});
  EXPECT_EQ(run(twice, nullptr, 0, noteProgress), "logic: Qor abort command");
  EXPECT_EQ(script.frames.size(), 1U);
}

TEST_F(Sequencer, DeliversAsManyStatusBitsAsItIsAskedForAndNoneWithoutACore) {
  QOR_CORE_INFO info{};
  std::vector<unsigned char> seen(3, 0xFF);
  const auto bits = [&](unsigned char* into, unsigned count) {
    return QorCore_getCoreStatus(session.handle, {0, 1, 0}, &info, into, count);
  };
  answer({word, word, noSuchCore});
  EXPECT_EQ(bits(seen.data(), 12), 0U);
  EXPECT_EQ(seen, std::vector<unsigned char>({0xFF, 0x0F, 0xFF}));
  EXPECT_EQ(bits(nullptr, 0), 0U);
  EXPECT_EQ(info.core_revision, 255U);
  EXPECT_EQ(status(), "nothing, 1");
  EXPECT_EQ(status(), "runtime: " + where + "no debug hub answers, TDO is all zeros, in 4 attempts, 9");
  EXPECT_EQ(status(16), "logic: the core index 16 is above 15, 9");
  EXPECT_EQ(thrownBy([&] { bits(nullptr, 8); }), "logic: the status word buffer is null");
}

TEST_F(Sequencer, RefusesNullRecordsAndResultsOfTheWrongSize) {
  Qor_ByteBuffer into(16, 0, 0);
  unsigned char result[5];
  EXPECT_EQ(thrownBy([&] {
              Qor_CoreComm::getCoreStatus(session.handle, {0, 1, 0}, nullptr, into, 128);
            }),
            "logic: the core information record of a status read is null");
  EXPECT_EQ(run(readText, result, 32), "logic: the result has 32 bits, but the command text returns 40");
  EXPECT_EQ(run(readText, nullptr, 40), "logic: the result of a command text that reads is null");
  EXPECT_EQ(run(writeText, result, 8), "logic: the result has 8 bits, but the command text returns 0");
  EXPECT_EQ(script.log, Lines());
}

}  // namespace

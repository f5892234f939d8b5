// The language of conditions, on fixed samples.
#include "board/model/Condition.h"

#include <gtest/gtest.h>

#include "board/model/Errors.h"

namespace {

using qor::Condition;

// value 0xA5 of eight bits: bit 0 rose, bit 7 fell, bit 1 did both; a word of 72 bits with its top bit set.
class Conditions : public testing::Test {
 protected:
  Conditions() {
    qor::Sample& sample = samples_[0];
    sample.asyncIn = qor::Bytes(10, 0);
    sample.asyncUp = sample.asyncDown = sample.asyncIn;
    sample.asyncIn[0] = 0xA5;
    sample.asyncIn[9] = 0x80;
    sample.asyncUp[0] = 0x03;
    sample.asyncDown[0] = 0x82;
    add({"level", qor::Port::asyncIn, {0, 1, 2, 3, 4, 5, 6, 7}});
    add({"signed", qor::Port::asyncIn, {0, 1, 2, 3, 4, 5, 6, 7}, qor::Radix::signedDec});
    add({"gain", qor::Port::asyncIn, {0, 1, 2, 3, 4, 5, 6, 7}, qor::Radix::dec, {}, 0.1, "dB"});
    add({"state", qor::Port::asyncIn, {0, 1, 2}, qor::Radix::hex, {{"IDLE", 0}, {"RUN", 5}}});
    std::vector<unsigned> bits;
    for (unsigned bit = 8; bit < 80; ++bit) bits.push_back(bit);
    add({"wide", qor::Port::asyncIn, bits});
    add({"wide-signed", qor::Port::asyncIn, bits, qor::Radix::signedDec});
  }

  void add(qor::Signal signal) { table_.add(std::move(signal)); }

  std::string outcome(const std::string& text) const {
    try {
      return Condition::parse(text, table_).isTrue(samples_) ? "true" : "false";
    } catch (const qor::WrongUse& error) {
      return error.what();
    }
  }

  qor::SignalTable table_;
  std::vector<qor::Sample> samples_{1};
};

TEST_F(Conditions, AreTrueOrFalseOrSayWhatIsWrong) {
  const char* const rows[][2] = {
      {"level == A5", "true"},
      {"level==0d165&&state==RUN", "true"},
      {"level != A5 || state == IDLE", "false"},
      {"level > a4 & level < A6 & level >= A5 & level <= A5", "true"},
      {"level > A5 | level < A5", "false"},
      {"signed < 0 && signed == -91 && signed > -92", "true"},
      {"gain == 16.5 && gain > 16.45dB && gain < 16.55 dB && !(gain >= 16.55)", "true"},
      {"gain == 16.45", "false"},
      {"!level", "false"},
      {"level[1] || !level[1:0]", "false"},
      {"level rises && level[0] rises && !(level[7] rises)", "true"},
      {"level[7] falls && !(level[0] falls) && level[1] moves && !(level[2] moves)", "true"},
      {"!!state && (state == \"RUN\" | wide)", "true"},
      {"wide == 800000000000000000 && wide > 7FFFFFFFFFFFFFFFFF", "true"},
      {"wide-signed < 0 && wide-signed < -1", "true"},
      {"levle == 1", "column 1: no input of that name (did you mean level?): levle"},
      {"state == RUN && level == 1FF", "column 26: level has 8 bits, too few for the value: 1FF"},
      {"(level == 1", "column 12: a ) is missing"},
      {"level == 1 state", "column 12: & or | is expected here, not: state"},
      {"level ==", "column 9: a value is expected here"},
      {"level && ", "column 10: a signal is expected here"},
      {"level[9]", "column 1: level has 8 bits: level[9]"},
      {"state == 'RUN", "column 10: the quote has no end: 'RUN"},
      {"", "column 1: a signal is expected here"},
  };
  for (const auto& [text, wanted] : rows) EXPECT_EQ(outcome(text), wanted) << text;
  EXPECT_EQ(outcome(std::string(4000, '(')), "column 201: too many parentheses");
  EXPECT_EQ(outcome(std::string(5000, ' ')), "a condition has 4096 characters at most, not 5000");
}

TEST_F(Conditions, AreBuiltOfObjects) {
  const qor::Signal level = table_.find("level", qor::Direction::input),
                    gain = table_.find("gain", qor::Direction::input);
  const Condition built =
      (Condition::compare(gain, qor::Relation::greater, 16.45) || Condition::isNotZero(level)) &&
      !Condition::edge(level, qor::Edge::falls);
  EXPECT_EQ(built.text(), "((gain > 16.45) || level) && (!(level falls))");
  EXPECT_FALSE(built.isTrue(samples_));
  EXPECT_EQ(outcome(built.text()), "false");
  ASSERT_EQ(built.signals().size(), 2U);
  EXPECT_THROW(Condition::compare(level, qor::Relation::equal, 256), qor::WrongUse);
}

}  // namespace

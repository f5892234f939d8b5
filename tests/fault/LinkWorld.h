// A core of 16 bits of every port in the middle of a chain, behind a faulty link, with what its design drove
// and saw on record. Each operation checks what its success and what its failure owes.
#pragma once

#include <array>
#include <cstdint>
#include <random>

#include "FaultyCable.h"
#include "tests/system/Board.h"

/// Holds a port. Its bytes are the arrays of the exported functions: these tests are for hosts that keep
/// the least significant byte first.
using Word = std::uint64_t;

constexpr unsigned portWidth = 16;
constexpr Word allOutputs = (Word{1} << portWidth) - 1;

using Words = std::array<Word, 2>;  // asynchronous, synchronous

/// Of the asynchronous, then of the synchronous inputs: value, up, down; of the latter clocked up and down.
using Inputs = std::array<Word, 8>;

inline unsigned char* bytes(Word& word) {
  return reinterpret_cast<unsigned char*>(&word);
}
inline const unsigned char* bytes(const Word& word) {
  return reinterpret_cast<const unsigned char*>(&word);
}

class LinkWorld {
 public:
  LinkWorld() {
    QorVIO_initCore(board.session, ref);
    QORVIO_CORE_INFO info{};
    QorVIO_getInfo(board.session, ref, &info);
    image_.initFromCoreInfo(info);
  }

  /// New values on all inputs, and a glitch of one bit of each kind somewhere in the next 9 clocks, which a read takes.
  void stir() {
    pins_ = {random(), random()};
    glitchIn_ = random() % 9;
    glitch_ = Word{1} << random() % portWidth;
  }

  /// The fault happens to the first so many exchanges of the next operation.
  void hit(const qorsim::Fault& fault, unsigned exchanges) {
    isHit_ = true;
    const auto out = [this, fault, exchanges](qorsim::PassingExchange& exchange) {
      if (isHit_ && exchanges > 1) hit(fault, exchanges - 1);
      if (isHit_ && fault.out) fault.out(exchange);
    };
    const auto back = [this, fault](qorsim::PassingExchange& exchange,
                                    const qorsim::PassingExchange& before) {
      if (isHit_ && fault.back) fault.back(exchange, before);
    };
    link.next({out, back});
  }

  QorJtag_Statistics statistics() const {
    QorJtag_Statistics now;
    QorJtag_session_getStatistics(board.session, now);
    return now;
  }

  /// A success drives every output to its last step and plays the pulse on synchronous bit 0 once; a failure
  /// does this too, or nothing at all.
  bool write() {
    std::array<std::uint16_t, 16> steps{};
    for (std::size_t i = 0; i < steps.size(); ++i)
      steps[i] = static_cast<std::uint16_t>((random() & ~Word{1}) | Word{i == 1});
    const Words wanted{random(), steps[15]};
    const Word before = outputs_[0];
    pulses_ = 0;
    const bool done = succeeded(QorVIO_setPortBits(
        board.session, ref, bytes(wanted[0]), bytes(allOutputs), portWidth,
        reinterpret_cast<const unsigned char*>(steps.data()), bytes(allOutputs), portWidth));
    isHit_ = false;
    for (int i = 0; i < 4 && !done; ++i) read();  // lets the design clock play what may have begun
    EXPECT_EQ(pulses_, outputs_[0] == before ? 0 : 1);
    EXPECT_TRUE(outputs_[0] == wanted[0] || (!done && outputs_[0] == before));
    EXPECT_TRUE(!done || outputs_ == wanted);
    return done;
  }

  bool read() {
    constexpr Word untouched = 0x5A5A;
    Inputs in;
    in.fill(untouched);
    const bool done = succeeded(QorVIO_getPortBits(board.session, ref, bytes(in[0]), bytes(in[1]),
                                                   bytes(in[2]), portWidth, bytes(in[3]), bytes(in[4]),
                                                   bytes(in[5]), bytes(in[6]), bytes(in[7]), portWidth));
    isHit_ = false;
    if (done) {
      told(in);
    } else {
      EXPECT_THAT(in, testing::Each(untouched));
    }
    return done;
  }

  /// Like read(), into an image that shows what a failure leaves in it.
  bool readImage() {
    const Inputs before = imageInputs();
    try {
      image_.readInputs(board.session, ref);
    } catch (const std::exception& e) {
      expectMessage(std::string("100 ") + e.what());
      EXPECT_EQ(imageInputs(), before);
      return false;
    }
    told(imageInputs());
    return true;
  }

  bool status() {
    QORVIO_CORE_INFO info{};
    std::fill_n(reinterpret_cast<unsigned char*>(&info), sizeof info, static_cast<unsigned char>(0x5A));
    const bool done = succeeded(QorVIO_getInfo(board.session, ref, &info));
    isHit_ = false;
    EXPECT_EQ(info.core_type, done ? 9 : 0);
    for (const unsigned width :
         {info.async_input_count, info.sync_input_count, info.async_output_count, info.sync_output_count})
      EXPECT_EQ(width, done ? portWidth : 0);
    return done;
  }

  bool initialise() {
    const bool done = succeeded(QorVIO_initCore(board.session, ref));
    EXPECT_EQ(QorRT::Qor_CoreList::getCore(board.session, ref) != nullptr, done);
    return done;
  }

  /// On a good link everything works.
  void expectGood() { EXPECT_TRUE(initialise() && write() && status() && expectActivityTold()); }

  /// On a good link two reads tell all activity since the last time, and none that was not there lately: what
  /// happens during the first of them is told by the second.
  bool expectActivityTold() {
    const bool done = readImage() && read();
    for (const std::size_t i : {1U, 2U, 4U, 5U, 6U, 7U}) {
      EXPECT_EQ(happened_[i] & ~told_[i], 0U) << "lost, " << i;
      EXPECT_EQ(told_[i] & ~(happened_[i] | lately_[i]), 0U) << "made up, " << i;
    }
    lately_ = std::exchange(happened_, {});
    told_ = {};
    return done;
  }

  const QOR_CORE_REF ref{1, 2, 3};

 private:
  static Word wordOf(const std::string& digits) {
    Word word = 0;
    for (std::size_t i = 0; i < digits.size(); ++i) word |= Word{digits[i] == '1'} << i;
    return word;
  }

  Inputs imageInputs() const {
    const QorRT::QorVIO_Command& c = image_;
    return {wordOf(c.getAsyncInValues()),        wordOf(c.getAsyncInActivityUp()),
            wordOf(c.getAsyncInActivityDown()),  wordOf(c.getSyncInValues()),
            wordOf(c.getSyncInActivityUp()),     wordOf(c.getSyncInActivityDown()),
            wordOf(c.getSyncInSyncActivityUp()), wordOf(c.getSyncInSyncActivityDown())};
  }

  Word random() { return random_() & allOutputs; }

  /// One design clock.
  void clock(qorsim::Ports& ports) {
    outputs_ = {};
    for (std::size_t i = 0; i < portWidth; ++i) {
      outputs_[0] |= Word{ports.asyncOut[i]} << i;
      outputs_[1] |= Word{ports.syncOut[i]} << i;
      ports.asyncIn[i] = pins_[0] >> i & 1;
      ports.syncIn[i] = pins_[1] >> i & 1;
      ports.asyncInGlitches[i] = ports.syncInGlitches[i] = glitchIn_ == 0 && glitch_ >> i & 1;
    }
    pulses_ += outputs_[1] & 1;
    const Word glitch = glitchIn_-- == 0 ? glitch_ : 0;
    const Word rises[] = {pins_[0] & ~sampled_[0], pins_[1] & ~sampled_[1]};
    const Word falls[] = {sampled_[0] & ~pins_[0], sampled_[1] & ~pins_[1]};
    const Inputs now{0,        rises[0] | glitch, falls[0] | glitch, 0, rises[1] | glitch, falls[1] | glitch,
                     rises[1], falls[1]};
    for (std::size_t i = 0; i < now.size(); ++i) happened_[i] |= now[i];
    sampled_ = pins_;
  }

  void told(const Inputs& in) {
    EXPECT_EQ(in[0], pins_[0]);
    EXPECT_EQ(in[3], pins_[1]);
    for (std::size_t i = 0; i < in.size(); ++i) told_[i] |= in[i];
  }

  bool succeeded(unsigned code) {
    const std::vector<std::string> messages = board.takeMessages();
    if (code == 0) return messages.empty();
    EXPECT_EQ(code, failed);
    EXPECT_EQ(messages.size(), 1U);
    for (const std::string& message : messages) expectMessage(message);
    return false;
  }

  static void expectMessage(const std::string& message) {
    const std::string seen =
        "(the hub did not answer the frame|the answer begins with [0-9A-F]{2}, which is no head|the CRC of "
        "the answer "
        "does not hold over (0|128|160) data bits|no debug hub answers, TDO is (all zeros|all ones|another "
        "pattern, its "
        "first 32 bits [0-9A-F]{8}))";
    static const testing::Matcher<std::string> whatIsSeen = testing::MatchesRegex(
        "100 device 1, user chain 2, core 3: (the link failed at (scan|bit) [0-9]+|the link is down|the "
        "write was "
        "refused when "
        "repeated: .*|no such core, or it cannot be (read|written)|" +
        seen + ", in 4 attempts|4 attempts: " + seen + "(; " + seen + "){3})");
    EXPECT_THAT(message, whatIsSeen);
  }

  std::mt19937_64 random_{20240607};
  Words pins_{}, sampled_{}, outputs_{};
  Word glitchIn_ = ~Word{0}, glitch_ = 0, pulses_ = 0;
  Inputs happened_{}, lately_{}, told_{};
  QorRT::QorVIO_Command image_;

  bool isHit_ = false;

  std::shared_ptr<QorRT::Qor_Cable> chain_ =
      qorsim::chain()
          .device()
          .named("near")
          .irLength(4)
          .device(0x0A5F1093)
          .named("fpga")
          .core(2, 3,
                qorsim::vio()
                    .asyncIn(portWidth)
                    .syncIn(portWidth)
                    .asyncOut(portWidth)
                    .syncOut(portWidth)
                    .design(qorsim::callback([this](qorsim::Ports& ports) { clock(ports); })))
          .device(0x1234567B)
          .named("far")
          .cable();
  std::unique_ptr<qorsim::FaultyCable> cable_ = std::make_unique<qorsim::FaultyCable>(chain_);

 public:
  qorsim::FaultyCable& link = *cable_;
  Board board{std::move(cable_)};
  Board other{std::make_unique<qorsim::FaultyCable>(chain_)};  // another program, on a good link
  qorsim::FaultyCable scans{chain_};                           // other software
};

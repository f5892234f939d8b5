// Everything that a link can do to a transfer: no wrong value reaches the caller, nothing is lost or done twice, and a
// single fault is not even noticed.
#include <array>
#include <cstdint>
#include <cstdio>
#include <functional>
#include <random>

#include "FaultyCable.h"
#include "tests/system/Board.h"

namespace {

using namespace qorsim;

// A port. Its bytes are the arrays of the exported functions: these tests are for hosts that keep the least significant
// byte first.
using Word = std::uint64_t;

constexpr unsigned width = 16;
constexpr Word all = (Word{1} << width) - 1;
constexpr QOR_CORE_REF ref{1, 2, 3};
constexpr unsigned everyAttempt = 4;

/// Of the asynchronous, then of the synchronous inputs: value, up, down; of the latter clocked up and down.
using Inputs = std::array<Word, 8>;

unsigned char* bytes(const Word& word) {
  return reinterpret_cast<unsigned char*>(const_cast<Word*>(&word));
}

/// A core in the middle of a chain, behind a faulty link, with what its design drove and saw on record. Each operation
/// checks what its success and what its failure owes.
class World {
 public:
  World() { expectGood(); }

  /// New values on all inputs, and a glitch of one bit of each kind somewhere in the next 9 clocks, which a read takes.
  void stir() {
    pins_ = {random(), random()};
    glitchIn_ = random() % 9;
    glitch_ = Word{1} << random() % width;
  }

  /// The fault happens to the first so many exchanges of the next operation; `then` after each of them.
  void hit(
      const Fault& fault, unsigned exchanges, const std::function<void()>& then = [] {}) {
    isHit_ = true;
    const auto out = [=](PassingExchange& exchange) {
      if (isHit_ && exchanges > 1) hit(fault, exchanges - 1, then);
      if (isHit_ && fault.out) fault.out(exchange);
    };
    const auto back = [=](PassingExchange& exchange, const PassingExchange& before) {
      if (isHit_ && fault.back) fault.back(exchange, before);
      then();
    };
    link.next({out, back});
  }

  QorJtag_Statistics statistics() const {
    QorJtag_Statistics now;
    QorJtag_session_getStatistics(board.session, now);
    return now;
  }

  /// A success drives every output to its last step and plays the pulse on synchronous bit 0 once; a failure does this
  /// too, or nothing at all.
  bool write() {
    std::array<std::uint16_t, 16> steps{};
    for (std::size_t i = 0; i < steps.size(); ++i)
      steps[i] = static_cast<std::uint16_t>((random() & ~Word{1}) | Word{i == 1});
    const Word async = random(), before = outputs_[0];
    pulses_ = 0;
    const bool done = succeeded(QorVIO_setPortBits(board.session, ref, bytes(async), bytes(all), width,
                                                   reinterpret_cast<const unsigned char*>(steps.data()),
                                                   bytes(all), width));
    for (int i = 0; i < 4 && !done; ++i) read();  // lets the design clock play what may have begun
    EXPECT_EQ(pulses_, outputs_[0] == before ? 0 : 1);
    EXPECT_TRUE(outputs_[0] == async || (!done && outputs_[0] == before));
    EXPECT_TRUE(!done || (outputs_[0] == async && outputs_[1] == steps[15]));
    return done;
  }

  bool read() {
    constexpr Word untouched = 0x5A5A;
    Inputs in;
    in.fill(untouched);
    const bool done = succeeded(QorVIO_getPortBits(board.session, ref, bytes(in[0]), bytes(in[1]),
                                                   bytes(in[2]), width, bytes(in[3]), bytes(in[4]),
                                                   bytes(in[5]), bytes(in[6]), bytes(in[7]), width));
    EXPECT_THAT(
        in, testing::Conditional(done, testing::Contains(testing::Ne(untouched)), testing::Each(untouched)));
    if (!done) return false;
    EXPECT_EQ(in[0], pins_[0]);
    EXPECT_EQ(in[3], pins_[1]);
    for (std::size_t i = 0; i < in.size(); ++i) told_[i] |= in[i];
    return true;
  }

  bool status() {
    QORVIO_CORE_INFO info{};
    std::fill_n(reinterpret_cast<unsigned char*>(&info), sizeof info, static_cast<unsigned char>(0x5A));
    const bool done = succeeded(QorVIO_getInfo(board.session, ref, &info));
    EXPECT_EQ(info.core_type, done ? 9 : 0);
    for (const unsigned count :
         {info.async_input_count, info.sync_input_count, info.async_output_count, info.sync_output_count})
      EXPECT_EQ(count, done ? width : 0);
    return done;
  }

  /// On a good link everything works.
  void expectGood() {
    EXPECT_EQ(QorVIO_initCore(board.session, ref), 0U);
    EXPECT_TRUE(write() && status() && expectActivityTold());
  }

  /// On a good link two reads report all activity since the last time, and none that was not there lately: what happens
  /// during the first of them is reported by the second.
  bool expectActivityTold() {
    const bool done = read() && read();
    for (const std::size_t i : {1U, 2U, 4U, 5U, 6U, 7U}) {
      EXPECT_EQ(happened_[i] & ~told_[i], 0U) << "lost, " << i;
      EXPECT_EQ(told_[i] & ~(happened_[i] | lately_[i]), 0U) << "made up, " << i;
    }
    lately_ = std::exchange(happened_, {});
    told_ = {};
    return done;
  }

 private:
  Word random() { return random_() & all; }

  /// One design clock.
  void clock(Ports& ports) {
    outputs_ = {};
    for (std::size_t i = 0; i < width; ++i) {
      outputs_[0] |= Word{ports.asyncOut[i]} << i;
      outputs_[1] |= Word{ports.syncOut[i]} << i;
      ports.asyncIn[i] = pins_[0] >> i & 1;
      ports.syncIn[i] = pins_[1] >> i & 1;
      ports.asyncInGlitches[i] = ports.syncInGlitches[i] = glitchIn_ == 0 && glitch_ >> i & 1;
    }
    pulses_ += outputs_[1] & 1;
    const Word glitch = glitchIn_-- == 0 ? glitch_ : 0;
    for (const std::size_t port : {0U, 1U}) {
      const Word rises = pins_[port] & ~sampled_[port], falls = sampled_[port] & ~pins_[port];
      happened_[3 * port + 1] |= rises | glitch;
      happened_[3 * port + 2] |= falls | glitch;
      if (port == 1) happened_[6] |= rises, happened_[7] |= falls;
    }
    sampled_ = pins_;
  }

  /// One message for a failure, which says what was seen.
  bool succeeded(unsigned code) {
    isHit_ = false;
    static const testing::Matcher<std::string> whatIsSeen = testing::MatchesRegex(
        "100 device 1, user chain 2, core 3: (the link failed at (scan|bit) [0-9]+|the link is down|the "
        "write was "
        "refused when repeated: .*|no such core, or it cannot be (read|written)|.*, in 4 attempts|4 "
        "attempts: .*)");
    EXPECT_EQ(code, code == 0 ? 0 : failed);
    EXPECT_THAT(board.takeMessages(),
                testing::Conditional(code == 0, testing::IsEmpty(), ElementsAre(whatIsSeen)));
    return code == 0;
  }

  std::mt19937_64 random_{20240607};
  std::array<Word, 2> pins_{}, sampled_{}, outputs_{};  // asynchronous, synchronous
  Word glitchIn_ = ~Word{0}, glitch_ = 0, pulses_ = 0;
  Inputs happened_{}, lately_{}, told_{};
  bool isHit_ = false;

  CoreSpec core_ = vio().asyncIn(width).syncIn(width).asyncOut(width).syncOut(width).design(
      callback([this](Ports& ports) { clock(ports); }));
  std::shared_ptr<QorRT::Qor_Cable> chain_ =
      chain().device().irLength(4).device().core(2, 3, core_).device().cable();
  std::unique_ptr<FaultyCable> cable_ = std::make_unique<FaultyCable>(chain_);

 public:
  FaultyCable& link = *cable_;
  Board board{std::move(cable_)};
  Board other{std::make_unique<FaultyCable>(chain_)};  // another program, on a good link
  FaultyCable scans{chain_};                           // other software
};

const std::pair<const char*, bool (World::*)()> operations[] = {
    {"write", &World::write}, {"read", &World::read}, {"status", &World::status}};

/// With the place of an operation.
class Link : public testing::TestWithParam<int> {
 protected:
  Link() {
    const std::uint64_t before = world.statistics().bits;
    EXPECT_TRUE((world.*run)());
    bits = world.statistics().bits - before;
  }

  /// One operation with the fault in some of its exchanges, and what is owed after it on a good link. True when it
  /// was done.
  bool isDone(const Fault& fault, unsigned exchanges) {
    world.stir();
    world.hit(fault, exchanges);
    const bool done = (world.*run)();
    EXPECT_TRUE(run == &World::read ? world.expectActivityTold() : (world.*run)());
    return done;
  }

  /// Tries the fault at each bit, or at every third when it happens to every attempt, and prints what became of it.
  /// True when the operation was done each time.
  bool isAlwaysDone(const char* what, unsigned exchanges, const std::function<Fault(std::size_t)>& faultAt) {
    std::size_t tried = 0, done = 0;
    for (std::size_t i = 0; i < bits && !HasFailure(); i += exchanges == 1 ? 1 : 3, ++tried) {
      SCOPED_TRACE(std::string(what) + ", " + std::to_string(i));
      done += isDone(faultAt(i), exchanges) ? 1 : 0;
    }
    std::printf("%s, %s in %u: %zu tried, %zu done\n", name, what, exchanges, tried, done);
    world.expectGood();
    return done == tried;
  }

  const char* const name = operations[GetParam()].first;
  bool (World::*const run)() = operations[GetParam()].second;
  World world;
  std::size_t bits = 0;
  std::minstd_rand random{1};
};

TEST_P(Link, ThatFailsOrFallsSilentIsReported) {
  for (const std::size_t scan : {0U, 1U}) {
    EXPECT_FALSE(isDone(failAt(scan), 1));
    EXPECT_TRUE(isDone(loseScan(scan), 1));
    EXPECT_EQ(isDone(loseScan(scan), everyAttempt), scan == 0);  // the chip has selected the chain already
    EXPECT_TRUE(isDone(silence(scan != 0), 1));
    EXPECT_FALSE(isDone(silence(scan != 0), everyAttempt));
  }
  EXPECT_TRUE(isDone(deliverLate(), 1));
  world.link.drop();
  EXPECT_FALSE((world.*run)());
  world.link.restore();
  world.expectGood();
}

TEST_P(Link, ThatFlipsLosesOrDoublesBitsIsNotNoticedUntilItAlwaysDoes) {
  const auto burst = [this] { return static_cast<unsigned>((random() & 0xFFFF) | 1); };
  const std::pair<const char*, std::function<Fault(std::size_t)>> faults[] = {
      {"captured bit flipped", [](std::size_t place) { return flipCaptured(place); }},
      {"sent bit flipped", [](std::size_t place) { return flipSent(place); }},
      {"captured burst", [&](std::size_t place) { return flipCaptured(place, burst()); }},
      {"sent burst", [&](std::size_t place) { return flipSent(place, burst()); }},
      {"captured bit lost", loseCaptured},
      {"captured bit doubled", doubleCaptured},
      {"sent bit lost", loseSent},
      {"sent bit doubled", doubleSent},
  };
  for (const auto& [what, faultAt] : faults) {
    EXPECT_TRUE(isAlwaysDone(what, 1, faultAt));
    EXPECT_FALSE(isAlwaysDone(what, everyAttempt, faultAt));
  }
}

TEST_P(Link, ThatEndsAtAnyTckLeavesNothingBehind) {
  EXPECT_FALSE(isAlwaysDone("scan cut", 1, cutAt));
}

INSTANTIATE_TEST_SUITE_P(, Link, testing::Range(0, 3),
                         [](const auto& each) { return std::string(operations[each.param].first); });

// Whatever they shift through any user register, before a transfer and between its attempts.
TEST(OtherSoftware, DoesNothingToACoreWithItsScans) {
  World world;
  std::minstd_rand random(2);
  const auto scanAnything = [&] {
    for (unsigned scans = random() % 4; scans != 0; --scans) {
      world.scans.scanIr(1, 1 + random() % 4);
      const std::size_t bits = 1 + random() % 600;
      std::vector<unsigned char> out((bits + 7) / 8, random() % 2 == 0 ? 0xFF : 0);
      for (std::size_t i = random() % 2 * out.size(); i-- > 0;) out[i] = static_cast<unsigned char>(random());
      world.scans.scanDr(1, out, bits, false);
    }
    world.scans.flush();
  };
  for (int i = 0; i < 200 && !testing::Test::HasFailure(); ++i) {
    world.stir();
    world.hit(random() % 2 == 0 ? flipCaptured(75, 0xFFFF) : flipSent(20),
              1 + static_cast<unsigned>(random()) % 3, scanAnything);
    EXPECT_TRUE((world.*operations[random() % 3].second)());
    EXPECT_TRUE(world.expectActivityTold());
  }
}

// Twenty times what a bad adapter does, so that some calls fail.
TEST(Noise, CostsTimeAndSomeCallsButNoValue) {
  World world;
  std::size_t failures = 0;
  for (int i = 0; i < 200 && !testing::Test::HasFailure(); ++i) {
    world.stir();
    world.link.noise(2e-3, 2e-3, static_cast<unsigned>(i));
    for (const auto& [name, run] : operations) failures += (world.*run)() ? 0 : 1;
    world.link.noise(0, 0);
    EXPECT_TRUE(world.expectActivityTold());
  }
  EXPECT_GT(world.statistics().repeatsBadCrc, failures);
}

// A write that another program's write came between is not repeated blindly: it is done once, or fails.
TEST(AnotherProgram, BetweenTheAttemptsOfAWriteNeverMakesItHappenTwice) {
  for (const bool reachesChip : {false, true}) {
    for (const bool writes : {false, true}) {
      World world;
      QorVIO_initCore(world.other.session, ref);
      world.hit(reachesChip ? flipCaptured(410, 0xFFFF) : flipSent(20), 1, [&] {
        TextMap none, *map = &none;
        EXPECT_EQ((writes ? QorVIO_writeValues : QorVIO_readValues)(world.other.session, ref, &map), 0U);
      });
      EXPECT_EQ(world.write(), !writes);
      EXPECT_TRUE(world.write());
    }
  }
}

}  // namespace

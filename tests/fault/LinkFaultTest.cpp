// Everything that a link can do to a transfer: no wrong value reaches the caller, nothing is lost or done twice, and a
// single fault is not even noticed.
#include <cstdio>
#include <functional>

#include "tests/fault/LinkWorld.h"

namespace {

using namespace qorsim;

struct Operation {
  const char* name;
  bool (LinkWorld::*run)();
};

void PrintTo(const Operation& operation, std::ostream* out) {
  *out << operation.name;
}

constexpr Operation operations[] = {
    {"write", &LinkWorld::write}, {"read", &LinkWorld::read}, {"status", &LinkWorld::status}};

constexpr unsigned everyAttempt = 4;

class Link : public testing::TestWithParam<Operation> {
 protected:
  Link() {
    world.expectGood();
    const std::uint64_t before = world.statistics().bits;
    EXPECT_TRUE((world.*operation.run)());
    bits = world.statistics().bits - before;
  }

  /// One operation with the fault in some of its exchanges, and what is owed after it on a good link. True when it
  /// was done.
  bool isDone(const Fault& fault, unsigned exchanges) {
    world.stir();
    world.hit(fault, exchanges);
    const bool done = (world.*operation.run)();
    EXPECT_TRUE(operation.run == &LinkWorld::read ? world.expectActivityTold() : (world.*operation.run)());
    return done;
  }

  /// Tries the fault at each bit, or at every third when it happens to every attempt, and prints what became of it.
  /// True when the operation was done each time.
  template <typename FaultAt>
  bool isAlwaysDone(const char* what, unsigned exchanges, FaultAt faultAt) {
    std::size_t tried = 0, done = 0;
    const std::uint64_t before = world.statistics().transfers;
    for (std::size_t i = 0; i < bits && !HasFailure(); i += exchanges == 1 ? 1 : 3, ++tried) {
      SCOPED_TRACE(std::string(what) + ", " + std::to_string(i));
      done += isDone(faultAt(i), exchanges) ? 1 : 0;
    }
    std::printf("%s, %s in %u: %zu tried, %zu done, %zu transfers\n", operation.name, what, exchanges, tried,
                done, static_cast<std::size_t>(world.statistics().transfers - before));
    world.expectGood();
    return done == tried;
  }

  const Operation operation = GetParam();
  LinkWorld world;
  std::size_t bits = 0;
  std::minstd_rand random{1};
};

TEST_P(Link, ThatFailsOrFallsSilentIsTold) {
  for (const std::size_t scan : {0U, 1U}) {
    EXPECT_FALSE(isDone(failAt(scan), 1));
    EXPECT_TRUE(isDone(loseScan(scan), 1));
    EXPECT_EQ(isDone(loseScan(scan), everyAttempt), scan == 0);  // the chip has selected the chain already
    EXPECT_TRUE(isDone(silence(scan != 0), 1));
    EXPECT_FALSE(isDone(silence(scan != 0), everyAttempt));
  }
  EXPECT_TRUE(isDone(deliverLate(), 1));
  world.link.drop();
  EXPECT_FALSE((world.*operation.run)());
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

INSTANTIATE_TEST_SUITE_P(, Link, testing::ValuesIn(operations),
                         [](const auto& each) { return std::string(each.param.name); });

// Whatever they shift through any user register, before a transfer and between its attempts.
TEST(OtherSoftware, DoesNothingToACoreWithItsScans) {
  LinkWorld world;
  world.expectGood();
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
    const bool breaksAnswer = random() % 2 == 0;
    const Fault damage = breaksAnswer ? flipCaptured(75, 0xFFFF) : flipSent(20);
    const auto back = [&](PassingExchange& exchange, const PassingExchange& before) {
      if (damage.back) damage.back(exchange, before);
      scanAnything();
    };
    world.hit({damage.out, back}, 1 + static_cast<unsigned>(random()) % 3);
    EXPECT_TRUE((world.*operations[random() % 3].run)());
    EXPECT_TRUE(world.expectActivityTold());
  }
}

// Twenty times what a bad adapter does, so that some calls fail.
TEST(Noise, CostsTimeAndSomeCallsButNoValue) {
  LinkWorld world;
  world.expectGood();
  std::size_t failures = 0;
  for (int i = 0; i < 200 && !testing::Test::HasFailure(); ++i) {
    world.stir();
    world.link.noise(2e-3, 2e-3, static_cast<unsigned>(i));
    for (const Operation& operation : operations) failures += (world.*operation.run)() ? 0 : 1;
    world.link.noise(0, 0);
    EXPECT_TRUE(world.expectActivityTold());
  }
  const QorJtag_Statistics link = world.statistics();
  std::printf("noise: %zu bits, %zu repeats, %zu of 600 calls failed\n", world.link.noisyBits(),
              static_cast<std::size_t>(link.repeatsNoHub + link.repeatsNoHead + link.repeatsBadCrc),
              failures);
  EXPECT_GT(link.repeatsBadCrc, failures);
}

// A write that another program's write came between is not repeated blindly: it is done once, or fails.
TEST(AnotherProgram, BetweenTheAttemptsOfAWriteNeverMakesItHappenTwice) {
  for (const bool reachesChip : {false, true}) {
    for (const bool writes : {false, true}) {
      LinkWorld world;
      world.expectGood();
      QorVIO_initCore(world.other.session, world.ref);
      const Fault damage = reachesChip ? flipCaptured(410, 0xFFFF) : flipSent(20);
      const auto back = [&](PassingExchange& exchange, const PassingExchange& before) {
        if (damage.back) damage.back(exchange, before);
        TextMap none, *map = &none;
        const unsigned code = writes ? QorVIO_writeValues(world.other.session, world.ref, &map)
                                     : QorVIO_readValues(world.other.session, world.ref, &map);
        EXPECT_EQ(code, 0U);
      };
      world.hit({damage.out, back}, 1);
      EXPECT_EQ(world.write(), !writes);
      EXPECT_TRUE(world.write());
    }
  }
}

}  // namespace

// Everything that a link can do to a transfer: no wrong value reaches the caller, and nothing is lost.
#include <cstdio>

#include "tests/fault/LinkWorld.h"

namespace {

using namespace qorsim;

/// An operation, and the DR bits of its exchange. Scan 0 is the IR scan.
struct Operation {
  const char* name;
  bool (LinkWorld::*run)();
  std::size_t scans, sentBits, lastSentBits, capturedBits;
};

void PrintTo(const Operation& operation, std::ostream* out) {
  *out << operation.name;
}

// 64 bits of every port: 1216 bits of a write, 640 of a read; 26 bits of a frame, 32 of an answer's rest.
constexpr Operation operations[] = {
    {"write", &LinkWorld::write, 3, 1242 + 32, 32, 32},
    {"read", &LinkWorld::read, 4, 26 + 672 + 32, 32, 672 + 32},
    {"image", &LinkWorld::readImage, 4, 26 + 672 + 32, 32, 672 + 32},
    {"status", &LinkWorld::status, 3, 26 + 160, 160, 160},
    {"initialise", &LinkWorld::initialise, 3, 26 + 160, 160, 160},
};

class Link : public testing::TestWithParam<Operation> {
 protected:
  /// One operation with the fault, and what is owed after it on a good link. True when the fault was caught.
  bool caught(const Fault& fault) {
    world.stir();
    world.link.next(fault);
    const bool done = (world.*operation.run)();
    EXPECT_TRUE(isRead() ? world.expectActivityTold() : (world.*operation.run)());
    return !done;
  }

  bool isRead() const { return operation.scans == 4; }

  /// Tries the fault at each place below `count` and prints what became of it. Returns how many were caught,
  /// and keeps the places of those that were not.
  template <typename FaultAt>
  std::size_t sweep(const char* what, std::size_t count, FaultAt faultAt) {
    harmless.clear();
    for (std::size_t i = 0; i < count && !HasFailure(); ++i) {
      SCOPED_TRACE(std::string(what) + ", " + std::to_string(i));
      if (!caught(faultAt(i))) harmless.push_back(i);
    }
    world.expectGood();
    std::printf("%s, %s: %zu tried, %zu caught, %zu harmless\n", operation.name, what, count,
                count - harmless.size(), harmless.size());
    return count - harmless.size();
  }

  const Operation operation = GetParam();
  LinkWorld world;
  std::vector<std::size_t> harmless;
};

TEST_P(Link, ThatFailsOrFallsSilentIsTold) {
  world.expectGood();
  EXPECT_EQ(sweep("scan failed", operation.scans, failAt), operation.scans);
  EXPECT_EQ(sweep("silence", 2, [](std::size_t level) { return silence(level != 0); }), 2U);
  // The chip has selected the chain already, and what becomes of the last frame is not asked.
  sweep("scan lost", operation.scans, loseScan);
  EXPECT_THAT(harmless, ElementsAre(0));
  world.link.drop();
  EXPECT_FALSE((world.*operation.run)());
  world.link.restore();
  world.expectGood();
}

class BitsOfLink : public Link {};

TEST_P(BitsOfLink, ThatFlipsUpToSixteenBitsIsCaught) {
  std::minstd_rand random(1);
  const std::size_t asked = operation.sentBits - operation.lastSentBits;
  for (const unsigned pattern : {1U, 0xFFFFU, 0U}) {
    const auto burst = [&] {
      return static_cast<unsigned>(pattern != 0 ? pattern : (random() & 0xFFFF) | 1);
    };
    const auto captured = [&](std::size_t i) { return flipCaptured(bit(i), burst()); };
    EXPECT_EQ(sweep("captured bits flipped", operation.capturedBits, captured), operation.capturedBits);
    // Nobody asks what became of the last frame, which does nothing; the next exchange finds it rejected.
    const std::size_t tried = pattern == 1 ? operation.sentBits : asked;
    EXPECT_EQ(sweep("sent bits flipped", tried, [&](std::size_t i) { return flipSent(bit(i), burst()); }),
              asked);
    EXPECT_THAT(harmless, testing::Each(testing::Ge(asked)));
  }
}

// What stays unseen changes nothing: a bit that leaves room for another of its value, all the way to the end
// of its scan or frame; ones before a frame; the last frame.
TEST_P(BitsOfLink, ThatLosesOrDoublesABitDoesNoHarm) {
  const std::size_t last = operation.scans - 1, asked = operation.sentBits - operation.lastSentBits;
  sweep("captured bit lost", operation.capturedBits, [](std::size_t i) { return loseCaptured(bit(i)); });
  sweep("captured bit doubled", operation.capturedBits, [](std::size_t i) { return doubleCaptured(bit(i)); });
  const auto ofLast = [last](std::size_t i) { return bit(i).ofScan(last); };
  const std::size_t lastBits = operation.lastSentBits;
  sweep("last bit lost", lastBits, [&](std::size_t i) { return loseCaptured(ofLast(i)); });
  sweep("last bit doubled", lastBits, [&](std::size_t i) { return doubleCaptured(ofLast(i)); });
  sweep("sent bit lost", asked, [](std::size_t i) { return loseSent(bit(i)); });
  sweep("sent bit doubled", asked, [](std::size_t i) { return doubleSent(bit(i)); });
}

// An exchange just like the one before has an answer just like it: where inputs may have changed meanwhile,
// a cable that delivers the wrong one of the two can't be found out, so a read is not tried after a read.
TEST_P(Link, ThatDeliversLateIsCaughtOrHarmless) {
  for (const Operation& before : operations) {
    SCOPED_TRACE(before.name);
    EXPECT_TRUE((world.*before.run)());
    const bool isSame = before.sentBits == operation.sentBits;
    if (isRead() && isSame) continue;
    EXPECT_EQ(caught(deliverLate()), !isSame);
  }
}

std::string nameOf(const testing::TestParamInfo<Operation>& each) {
  return each.param.name;
}

// The others differ from these in what is made of the bits of an exchange, not in the exchange.
constexpr Operation exchanges[] = {operations[0], operations[2], operations[3]};

INSTANTIATE_TEST_SUITE_P(, Link, testing::ValuesIn(operations), nameOf);
INSTANTIATE_TEST_SUITE_P(, BitsOfLink, testing::ValuesIn(exchanges), nameOf);

// The head that one leaves would answer for the next, when that does not arrive.
TEST(BrokenOff, TransfersDoNotAnswerForLaterOnes) {
  LinkWorld world;
  world.link.next(failAt(2)).next({}).next(loseScan(1));
  EXPECT_FALSE(world.write());
  EXPECT_FALSE(world.write());
  world.link.next(failAt(1)).next({}).next(failAt(2)).next({}).next(loseScan(1));
  EXPECT_FALSE(world.read());
  EXPECT_FALSE(world.read());
  world.stir();
  EXPECT_FALSE(world.read());
  world.expectGood();
}

}  // namespace

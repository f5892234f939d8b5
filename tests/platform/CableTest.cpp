#include <gtest/gtest.h>

#include "tests/platform/ScriptedCable.h"

namespace {

using Bytes = std::vector<unsigned char>;
using Lines = std::vector<std::string>;

class CableQueue : public testing::Test {
 protected:
  std::string captured(std::size_t scan) {
    return resultOf([=] { return hexOf(bitsOfBytes(cable.captured(scan), 16)); });
  }

  std::shared_ptr<Script> script = std::make_shared<Script>();
  ScriptedCable cable{script};
};

TEST_F(CableQueue, RunsEverythingInOneExchangeAndOnceAndStartsAnew) {
  script->answers = {bitsOf(0x2A5, 10)};
  cable.scanIr(1, 4);
  cable.scanDr(1, {0xFF, 0x01}, 9, false);
  const std::size_t second = cable.scanDr(0, {0x00, 0x02}, 10, true);
  cable.idle(3);
  EXPECT_EQ(script->log, Lines());
  EXPECT_EQ(captured(second), "FEA5");
  cable.flush();
  const std::size_t next = cable.scanDr(0, {0x01}, 1, true);
  EXPECT_EQ(captured(next), "00FE");
  cable.idle(2);
  cable.drop();
  cable.flush();
  EXPECT_EQ(script->log, Lines({"ir 1 4", "dr 1 9 1FF", "dr 0 10 200", "idle 3", "run", "dr 0 1 1", "run"}));
}

TEST_F(CableQueue, QueuesNothingThatTheChainCannotDo) {
  const auto ir = [&](unsigned device, unsigned chain) {
    return thrownBy([&] { cable.scanIr(device, chain); });
  };
  const auto dr = [&](unsigned device, const Bytes& out, std::size_t bits) {
    return thrownBy([&] { cable.scanDr(device, out, bits, true); });
  };
  EXPECT_EQ(ir(2, 1), "logic: there is no device 2: the chain has 2 devices");
  EXPECT_EQ(ir(0, 0), "logic: device 0 has no user chain 0: they are 1 to 4");
  EXPECT_EQ(ir(0, 5), "logic: device 0 has no user chain 5: they are 1 to 4");
  EXPECT_EQ(dr(2, {0}, 8), "logic: there is no device 2: the chain has 2 devices");
  EXPECT_EQ(dr(0, {0}, 9), "logic: a DR scan of 9 bits does not fit 1 bytes");
  EXPECT_EQ(dr(0, {0, 0}, 8), "logic: a DR scan of 8 bits does not fit 2 bytes");
  cable.flush();
  EXPECT_EQ(script->log, Lines());
}

TEST_F(CableQueue, HasNoCaptureOfAScanThatDidNotCaptureOrFailed) {
  const std::string nothing = "logic: scan 0 of the queue captured nothing";
  EXPECT_EQ(captured(cable.scanDr(0, {0x01}, 1, false)), nothing);
  EXPECT_EQ(captured(7), "logic: scan 7 of the queue captured nothing");
  script->failure = "the link is dead";
  const std::size_t lost = cable.scanDr(0, {0x01}, 1, true);
  EXPECT_EQ(captured(lost), "runtime: the link is dead");
  EXPECT_EQ(captured(lost), nothing);
  EXPECT_EQ(script->log.size(), 4U);
}

TEST(Cable, MayNotDeliverLessThanAScanCaptures) {
  class Deaf : public QorRT::Qor_Cable {
    const std::vector<QorRT::Qor_Device>& devices() const override { return devices_; }
    void run(std::vector<QorRT::Qor_Scan>&) override {}
    std::vector<QorRT::Qor_Device> devices_{{0, "deaf", 4}};
  } deaf;
  deaf.scanDr(0, {0x00, 0x00}, 16, true);
  EXPECT_EQ(thrownBy([&] { deaf.flush(); }), "runtime: the cable delivered 0 of the 2 bytes of a scan");
}

}  // namespace

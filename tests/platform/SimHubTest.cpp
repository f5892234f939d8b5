// The hub at the level of single scans.
#include <gtest/gtest.h>

#include "tests/platform/SimHost.h"

namespace {

using qorsim::chain;
using qorsim::Ports;
using qorsim::vio;

TEST(SimHub, deliversTheWorkedExample) {
  const auto design = qorsim::callback(
      [](Ports& ports) {
        ports.asyncIn[0] = ports.syncIn[0] = 1;
        ports.syncIn[1] = 0;
      },
      [](Ports& ports) { ports.syncIn[1] = 1; });
  const auto core = vio().asyncOut(2).syncOut(1).asyncIn(1).syncIn(2).design(design);
  const auto cable = chain().device(1).core(1, 0, core).cable();
  const struct {
    std::size_t bits;
    std::string out, in;
  } scans[] = {
      {236, "FFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFFEB263E808004401",
       "00E23A6595000010002000200010000100000A0951D0000000000000001"},
      {161, "1FFFFFFFFFFFFDA199DEA400012BC70B9B0004409", "0010BBCD327A00000000000000000000000000001"},
      {124, "FFFFFFFFFFFFFFFFEBB79116C00440D", "00AC9466D8CD0AD0000000000000001"},
  };
  SimHost host(*cable);
  for (const auto& scan : scans) EXPECT_EQ(hexOf(host.scan(bitsOfHex(scan.out, scan.bits))), scan.in);
}

}  // namespace

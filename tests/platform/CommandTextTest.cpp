#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "QorCore.h"
#include "tests/platform/ScriptedCable.h"

namespace {

using QorRT::Qor_CoreComm;

const std::string write2 = "\n00 1 0 02 0 00000004 0", read2 = "\n00 1 0 04 1 00000004 0";
const std::string write1 = "00 1 0 01 0 00000006 1F", read1 = "00 1 0 03 1 00000010 0";

TEST(CommandText, IsRefusedBeforeAnythingIsSent) {
  struct {
    std::string text;
    const char* where;
  } const cases[] = {
      {"", "1, device index: "},
      {write1 + write2 + "\n", "3, device index: "},
      {" " + write1 + write2, "1, device index: "},
      {"0 1 0 01 0 00000006 1F" + write2, "1, device index: 0"},
      {"0a 1 f 01 1 00000006 1F" + write2, "1, capture flag: 1"},
      {"00  1 0 01 0 00000006 1F" + write2, "1, user chain number: "},
      {"00 1 G 01 0 00000006 1F" + write2, "1, core index: G"},
      {"00 1 0 00 0 00000006 1F" + write2, "1, code: 00"},
      {"00 1 0 01 1 00000006 1F" + write2, "1, capture flag: 1"},
      {"00 1 0 03 0 00000010 0" + read2, "1, capture flag: 0"},
      {"00 1 0 01 0 6 1F" + write2, "1, bit count: 6"},
      {"00 1 0 01 0 00000000 0" + write2, "1, bit count: 00000000"},
      {"00 1 0 03 1 0000000F 0" + read2, "1, bit count: 0000000F"},
      {"00 1 0 01 0 00000006 " + write2, "1, data: "},
      {"00 1 0 01 0 00000006 1F " + write2, "1, data: 1F "},
      {"00 1 0 01 0 00000006 1G" + write2, "1, data: 1G"},
      {"00 1 0 01 0 00000006 20" + write2, "1, data: 20"},
      {"00 1 0 01 0 00000001 1" + write2, "1, data: 1"},
      {"00 1 0 01 0 00000006 " + std::string(50, '0') + write2,
       "1, data: 0000000000000000000000000000000000000000..."},
      {write1 + "\n01 1 0 02 0 00000004 0", "2, device index: 01"},
      {write1 + "\n00 2 0 02 0 00000004 0", "2, user chain number: 2"},
      {write1 + "\n00 1 F 02 0 00000004 0", "2, core index: F"},
      {read1 + write2, "2, code: 02"},
      {write1 + "\n00 1 0 02 1 00000004 0", "2, capture flag: 1"},
      {write1 + "\n00 1 0 02 0 00000005 0", "2, bit count: 00000005"},
      {write1 + write2 + "\n" + write1 + read2, "4, code: 04"},
  };
  ScriptedSession session;
  for (const auto& c : cases) {
    const auto call = [&] { Qor_CoreComm::commandSequence(session.handle, c.text, nullptr, 0, nullptr); };
    EXPECT_EQ(thrownBy(call), std::string("logic: command text line ") + c.where) << c.text;
  }
  EXPECT_EQ(session.script->log, std::vector<std::string>());
}

TEST(CommandText, ReadsDataAsANumberOfAnyLengthThatFits) {
  for (const char* data : {"1F", "1f", "F", "0"}) {
    ScriptedSession session;
    session.script->answers = {Reply(), Reply()};
    const std::string text = "00 1 0 01 0 00000006 " + std::string(data) + write2;
    Qor_CoreComm::commandSequence(session.handle, text, nullptr, 0, nullptr);
    EXPECT_EQ(bitsOfHex(session.script->frames[1].substr(4, 2), 5), bitsOfHex(data, 5));
  }
}

}  // namespace

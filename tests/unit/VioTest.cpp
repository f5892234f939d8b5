#include "tests/unit/VioTest.h"

#include "QorUtil.h"

std::string VioTest::writtenDigits(std::size_t count) {
  std::string data;
  for (const std::string& call : platform.take()) {
    if (call.rfind("sequence ", 0) != 0) continue;
    EXPECT_TRUE(data.empty()) << "more than one write";
    std::string firstLine = call.substr(0, call.find('\n'));
    data = firstLine.substr(firstLine.rfind(' ') + 1);
  }
  std::string digits;
  return QorRT::Qor_NumberUtil::hexStr2BinStr(data.c_str(), static_cast<unsigned>(count), digits);
}

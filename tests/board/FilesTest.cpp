// Signals files and play scripts: what is refused, and where it says so.
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "board/model/CoreAddress.h"
#include "board/model/Errors.h"
#include "board/model/SignalFile.h"
#include "board/model/Value.h"
#include "board/record/PlayScript.h"

namespace {

struct File {
  explicit File(const std::string& text) { std::ofstream(path) << text; }
  ~File() { std::filesystem::remove(path); }

  const std::string path = testing::TempDir() + "file" + std::to_string(getpid()) + ".toml";
};

template <class Read>
std::string problemOf(const std::string& path, Read read) {
  try {
    read(path);
  } catch (const qor::WrongUse& error) {
    const std::string text = error.what();
    return text.rfind(path, 0) == 0 ? text.substr(path.size() + 1) : text;
  }
  return "";
}

std::string problemOfSignals(const std::string& path) {
  return problemOf(path, [](const std::string& file) { qor::readSignalFile(file); });
}

// Every row ends its first signal, whose port is on the first line after the head.
TEST(SignalFile, SaysWhatIsWrongAndWhere) {
  const std::string another = "\n[[signal]]\nport = \"async_out\"\nbits = 2\n";
  const std::pair<std::string, const char*> rows[] = {
      {"name = \"$end\"", "3: signal[0].name: must be letters, digits, _, - and /, is \"$end\""},
      {"name = \"a\"\nbits = [1, 1]", "4: signal[0].bits: names bit 1 of an output twice"},
      {"name = \"a\"\nbits = 65535", "4: signal[0].bits: a bit is 0 to 65534, is 65535"},
      {"name = \"a\"\nbits = \"3:0\"\nenum = { \"10\" = 3 }",
       "5: signal[0].enum.10: can be read as a number"},
      {"name = \"a\"\nbits = \"3:0\"\nenum = { x = 3, y = 3 }",
       "5: signal[0].enum.y: has the value of another name: 3"},
      {"name = \"a\"\nbits = \"3:0\"\nenum = { x = 16 }", "5: signal[0].enum.x: is too wide for 4 bits"},
      {"name = \"a\"\nbits = 1\nscale = nan", "5: signal[0].scale: must be a number other than 0"},
      {"name = \"a\"\nbits = 1\nunit = \"\\u001B[2J\"",
       "5: signal[0].unit: must be a text without control characters"},
      {"name = \"a\"\nbits = 1\ncolour = 1", "5: signal[0].colour: is no key of this file"},
      {"name = \"a\"\nbits = 1\ncore = \"1.1\"",
       "5: signal[0].core: not a core address DEVICE.CHAIN.INDEX: 1.1"},
      {"name = \"a\"\nbits = 1\ncore = 1", "5: signal[0].core: must be a text"},
      {"name = \"a\"\nbits = 1\ncore = \"1.1.0\"" + another + "name = \"b\"",
       "6: signal[1]: has no core, nor has the file, but the signals above have one"},
      {"name = \"a\"\nbits = 1" + another + "name = \"b\"\ncore = \"1.1.0\"",
       "9: signal[1].core: is given, but the signals above have none, nor has the file"},
      {"name = \"a\"\nbits = 1" + another + "name = \"A\"", "8: signal[1].name: is there already: A"},
  };
  for (const auto& [text, wanted] : rows) {
    const File file("[[signal]]\nport = \"async_out\"\n" + text);
    EXPECT_EQ(problemOfSignals(file.path), wanted) << text;
  }
}

TEST(SignalFile, NamesSeveralCores) {
  const File file(
      "[[signal]]\nname = \"a\"\nport = \"sync_in\"\nbits = [7, 0]\ncore = \"1.1.0\"\n"
      "[[signal]]\nname = \"a\"\nport = \"sync_out\"\nbits = 2\ncore = \"0.1.0\"\n");
  const qor::SignalTable table = qor::readSignalFile(file.path);
  ASSERT_EQ(table.cores().size(), 2U);
  EXPECT_EQ(qor::refText(table.cores()[1]), "0.1.0");
  EXPECT_EQ(table.find("a", qor::Direction::output).core, 1U);
  EXPECT_EQ(qor::bitsText(table.find("a", qor::Direction::input).bits), "7,0");
}

TEST(PlayScript, TakesRowsOrSaysWhatIsWrong) {
  qor::SignalTable table;
  table.add({"a", qor::Port::asyncOut, {0, 1, 2, 3}});
  table.add({"b,c", qor::Port::syncOut, {0}});
  const std::pair<const char*, const char*> rows[] = {
      {"a\n1\n2\n", ""},
      {"\xEF\xBB\xBF\r\n a , \"b,c\"\r\n\r\n1, 0x1\r\n", ""},
      {"a\n", "1: has no row of values below its names"},
      {"", "1: has no row of values below its names"},
      {"\n\na\n", "3: has no row of values below its names"},
      {"a,A\n1,1\n", "1: names an output twice: a"},
      {"a\n\n1F\n", "3: a has 4 bits, too few for the value: 1F"},
  };
  for (const auto& [text, wanted] : rows) {
    EXPECT_EQ(
        problemOf("f", [&, t = text](const std::string& path) { qor::parsePlayScript(t, path, table); }),
        wanted);
  }
  const qor::PlayScript script = qor::parsePlayScript("time_s,a\n0,1\n1.5,2\n", "f", table);
  EXPECT_EQ(script.times[1], std::chrono::milliseconds(1500));
  EXPECT_EQ(script.rows[1][0], qor::Bytes{2});
}

}  // namespace

// What is remembered of outputs, from run to run.
#include "board/session/OutputMemory.h"

#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "board/model/Errors.h"
#include "os/FileLock.h"

namespace {

namespace fs = std::filesystem;

/// In a folder of its own; a core of eight asynchronous output bits.
class Memory : public testing::Test {
 protected:
  Memory() { info_.async_output_count = 8; }
  ~Memory() override { fs::remove_all(folder_); }

  qor::OutputMemory open(const std::string& key = "key") const { return {info_, folder_.string(), key}; }

  static qor::Signal bit(unsigned index) { return {"bit", qor::Port::asyncOut, {index}}; }
  static void set(qor::OutputMemory& memory, unsigned index, unsigned char value) {
    memory.set(bit(index), {value});
  }

  // Bit 0 first: 0, 1, or ? where it is not known.
  static std::string textOf(const qor::OutputMemory& memory) {
    std::string text;
    for (unsigned index = 0; index < 8; ++index) {
      const auto value = memory.lastGiven(bit(index));
      text += !value ? '?' : (*value)[0] != 0 ? '1' : '0';
    }
    return text;
  }

  const fs::path folder_ = testing::TempDir() + "output_memory" + std::to_string(getpid());
  const fs::path file_ = folder_ / "key.json";
  QORVIO_CORE_INFO info_{};
};

TEST_F(Memory, BelongsToTheWholeKey) {
  const std::string key(300, 'a');
  const std::string keys[] = {"a/b", "a%b", "a_b", key + "1", key + "2"};
  for (unsigned i = 0; i < 5; ++i) {
    qor::OutputMemory memory = open(keys[i]);
    set(memory, i, 1);
  }
  for (unsigned i = 0; i < 5; ++i)
    EXPECT_EQ(textOf(open(keys[i])), std::string("????????").replace(i, 1, "1")) << keys[i];
}

TEST_F(Memory, TakesFromOthersWhatItDidNotGiveSinceItSaved) {
  qor::OutputMemory memory = open();
  set(memory, 0, 1);
  memory.save();
  {
    qor::OutputMemory other = open();
    set(other, 0, 0);
    set(other, 1, 1);
  }
  set(memory, 2, 1);
  memory.save();
  EXPECT_EQ(textOf(memory), "011?????");
  EXPECT_EQ(textOf(open()), "011?????");
}

TEST_F(Memory, KnowsNothingOfWhatItCannotTrust) {
  const std::string whole = R"({"async_out":"01","async_out_known":"03","sync_out":"","sync_out_known":"0"})";
  const std::pair<std::string, const char*> rows[] = {
      {whole, "10??????"},
      {whole.substr(0, 30), "????????"},
      {R"({"async_out":"01"})", "????????"},
      {R"({"async_out":"101","async_out_known":"03"})", "????????"},
      {R"({"async_out":1,"async_out_known":"03"})", "????????"},
      {whole + std::string(2 << 20, ' '), "????????"},
  };
  fs::create_directories(folder_);
  for (const auto& [text, known] : rows) {
    std::ofstream(file_) << text;
    EXPECT_EQ(textOf(open()), known) << text.substr(0, 60);
  }
  fs::remove(file_);
  ASSERT_EQ(mkfifo(file_.c_str(), 0600), 0);
  EXPECT_EQ(textOf(open()), "????????");
  EXPECT_EQ(textOf(qor::OutputMemory(info_, true)), "00000000");
  EXPECT_EQ(textOf(qor::OutputMemory(info_, false)), "????????");
}

TEST_F(Memory, SaysThatOthersKeepItLocked) {
  fs::create_directories(folder_);
  qor::OutputMemory memory = open();
  set(memory, 0, 1);
  const os::FileLock lock((folder_ / ".lock").string(), std::chrono::milliseconds(0));
  try {
    memory.save();
    ADD_FAILURE() << "saved";
  } catch (const qor::Failure& failure) {
    EXPECT_EQ(failure.what(), "cannot remember what the outputs were given, in " + file_.string() +
                                  ": another program keeps the folder locked");
  }
}

}  // namespace

// What is remembered of outputs: by whom, and for whom.
#include "board/session/OutputMemory.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>

namespace {

namespace fs = std::filesystem;

/// In a folder of its own.
class Memory : public testing::Test {
 protected:
  Memory() {
    info_.async_output_count = 8;
    fs::create_directories(folder_);
    setenv("XDG_STATE_HOME", folder_.c_str(), 1);
  }
  ~Memory() override { fs::remove_all(folder_); }

  qor::OutputMemory open(const std::string& key) const { return {key, info_}; }
  static unsigned imageOf(const qor::OutputMemory& memory) {
    return memory.image(qor::Port::asyncOut).front();
  }
  static void set(qor::OutputMemory& memory, unsigned bit, unsigned char value) {
    memory.set({"bit", qor::Port::asyncOut, {bit}}, {value});
  }

  const fs::path folder_ = testing::TempDir() + "output_memory" + std::to_string(getpid());
  QORVIO_CORE_INFO info_{};
};

TEST_F(Memory, BelongsToTheWholeKey) {
  const std::string key(300, 'a');
  const std::string keys[] = {"a/b", "a%b", "a_b", key + "1", key + "2"};
  for (unsigned i = 0; i < 5; ++i) {
    qor::OutputMemory memory = open(keys[i]);
    set(memory, i, 1);
  }
  for (unsigned i = 0; i < 5; ++i) EXPECT_EQ(imageOf(open(keys[i])), 1U << i) << keys[i];
}

TEST_F(Memory, TakesFromOthersWhatItDidNotGiveSinceItSaved) {
  qor::OutputMemory memory = open("key");
  set(memory, 0, 1);
  memory.save();
  {
    qor::OutputMemory other = open("key");
    set(other, 0, 0);
    set(other, 1, 1);
  }
  set(memory, 2, 1);
  memory.save();
  EXPECT_EQ(imageOf(memory), 6U);
  EXPECT_EQ(imageOf(open("key")), 6U);
}

}  // namespace

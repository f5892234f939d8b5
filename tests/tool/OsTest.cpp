// What the system is asked for, where it can say no.
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>
#include <filesystem>
#include <fstream>
#include <system_error>

#include "os/FileLock.h"
#include "os/Files.h"
#include "os/Process.h"

namespace {

namespace fs = std::filesystem;
using std::chrono::milliseconds;

class Files : public testing::Test {
 protected:
  Files() { fs::permissions(folder, fs::perms::owner_all); }
  ~Files() override { fs::remove_all(folder); }

  static fs::path made() {
    std::string name = testing::TempDir() + "qorvio-XXXXXX";
    return mkdtemp(name.data());
  }
  std::string at(const char* name) const { return folder / name; }

  const fs::path folder = made();
};

template <class Action>
std::errc errorOf(Action action) {
  try {
    action();
  } catch (const std::system_error& error) {
    return static_cast<std::errc>(error.code().value());
  }
  return {};
}

TEST_F(Files, LockIsWaitedForAndNoLonger) {
  const auto lock = [&](const char* name) {
    return errorOf([&] { os::FileLock(at(name), milliseconds(20)); });
  };
  {
    const os::FileLock held(at("lock"), milliseconds(0));
    EXPECT_EQ(lock("lock"), std::errc::timed_out);
  }
  EXPECT_EQ(lock("lock"), std::errc());
  fs::create_symlink("lock", at("link"));
  EXPECT_EQ(lock("link"), std::errc::too_many_symbolic_link_levels);
}

TEST_F(Files, ReadsRegularFilesAlone) {
  const auto read = [&](const char* name) { return errorOf([&] { os::readFile(at(name), 4); }); };
  std::ofstream(at("four")) << "four";
  std::ofstream(at("five!")) << "five!";
  mkfifo(at("pipe").c_str(), 0600);
  EXPECT_EQ(os::readFile(at("four"), 4), "four");
  EXPECT_EQ(read("five!"), std::errc::file_too_large);
  EXPECT_EQ(read("pipe"), std::errc::invalid_argument);
  EXPECT_EQ(read("."), std::errc::is_a_directory);
  EXPECT_EQ(read("none"), std::errc::no_such_file_or_directory);
}

TEST_F(Files, ReplacesAFileWithoutFollowingLinks) {
  std::ofstream(at("victim")) << "untouched";
  fs::create_symlink("victim", at(("file." + std::to_string(os::processId())).c_str()));
  os::replaceFile(at("file"), "new");
  EXPECT_EQ(os::readFile(at("file"), 99), "new");
  EXPECT_EQ(os::readFile(at("victim"), 99), "untouched");
  EXPECT_EQ(std::distance(fs::directory_iterator(folder), {}), 2);
}

TEST_F(Files, TrustsWhatNobodyElseCouldHaveWritten) {
  std::ofstream(at("file")) << "text";
  EXPECT_EQ(os::distrust(at("file")), "");
  fs::permissions(at("file"), fs::perms::others_write, fs::perm_options::add);
  EXPECT_EQ(os::distrust(at("file")), at("file") + " can be written by other users");
  fs::permissions(at("file"), fs::perms::others_write, fs::perm_options::remove);
  fs::permissions(folder, fs::perms::all);
  EXPECT_EQ(os::distrust(at("file")), folder.string() + " can be written by other users");
  fs::permissions(folder, fs::perms::all | fs::perms::sticky_bit);
  EXPECT_EQ(os::distrust(at("file")), "");
  if (geteuid() != 0 || chown(at("file").c_str(), 1, 1) != 0) return;  // only root can give a file away
  EXPECT_EQ(os::distrust(at("file")), at("file") + " belongs to another user");
}

}  // namespace

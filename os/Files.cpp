#include "os/Files.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <system_error>

namespace os {
namespace {

[[noreturn]] void fail(int error, const char* what, const std::string& path) {
  throw std::system_error(error, std::generic_category(), std::string(what) + path);
}

class Descriptor {
 public:
  explicit Descriptor(int number) : number_(number) {}
  Descriptor(const Descriptor&) = delete;
  Descriptor& operator=(const Descriptor&) = delete;
  ~Descriptor() {
    if (number_ >= 0) close(number_);
  }
  int number() const { return number_; }

 private:
  int number_;
};

// 0 for a regular file that is not too large, else the error.
int problemOf(const struct stat& facts, std::size_t limit) {
  if (S_ISDIR(facts.st_mode)) return EISDIR;
  if (!S_ISREG(facts.st_mode)) return EINVAL;
  return static_cast<std::size_t>(facts.st_size) > limit ? EFBIG : 0;
}

bool writeAll(int file, std::string_view text) {
  while (!text.empty()) {
    const ssize_t count = write(file, text.data(), text.size());
    if (count < 0 && errno != EINTR) return false;
    text.remove_prefix(static_cast<std::size_t>(std::max<ssize_t>(0, count)));
  }
  return true;
}

// A file of one's own group is as good as one's own: many systems give every user a group.
bool isWritableByOthers(const struct stat& facts) {
  const bool byGroup = (facts.st_mode & S_IWGRP) != 0 && facts.st_gid != getegid();
  return byGroup || (facts.st_mode & S_IWOTH) != 0;
}

std::string distrustOf(const std::filesystem::path& path, bool isFolder) {
  struct stat facts {};
  if (stat(path.c_str(), &facts) != 0) fail(errno, "cannot read the file ", path);
  if (facts.st_uid != geteuid() && facts.st_uid != 0) return path.string() + " belongs to another user";
  // In a sticky folder, such as /tmp, nobody can replace the files of others.
  const bool isSticky = isFolder && (facts.st_mode & S_ISVTX) != 0;
  return isWritableByOthers(facts) && !isSticky ? path.string() + " can be written by other users" : "";
}

}  // namespace

std::string readFile(const std::string& path, std::size_t limit) {
  constexpr const char* what = "cannot read the file ";
  const Descriptor file(open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK));
  struct stat facts {};
  if (file.number() < 0 || fstat(file.number(), &facts) != 0) fail(errno, what, path);
  if (const int problem = problemOf(facts, limit)) fail(problem, what, path);
  std::string text;
  char block[1 << 16];
  for (ssize_t count = 0; (count = read(file.number(), block, sizeof block)) != 0;) {
    if (count < 0 && errno != EINTR) fail(errno, what, path);
    text.append(block, static_cast<std::size_t>(std::max<ssize_t>(0, count)));
    if (text.size() > limit) fail(EFBIG, what, path);
  }
  return text;
}

std::string distrust(const std::string& path) {
  std::error_code failed;
  const std::filesystem::path place = std::filesystem::canonical(path, failed);
  if (failed) fail(failed.value(), "cannot read the file ", path);
  const std::string reason = distrustOf(place, false);
  return reason.empty() ? distrustOf(place.parent_path(), true) : reason;
}

void replaceFile(const std::string& path, std::string_view content) {
  constexpr const char* what = "cannot write the file ";
  const std::string fresh = path + "." + std::to_string(getpid());  // of this run alone
  unlink(fresh.c_str());  // of a run long ago that had the same number
  int error = 0;
  {
    const Descriptor file(open(fresh.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0666));
    if (file.number() < 0) fail(errno, what, path);
    if (!writeAll(file.number(), content)) error = errno;
  }
  if (error == 0 && std::rename(fresh.c_str(), path.c_str()) != 0) error = errno;
  if (error == 0) return;
  unlink(fresh.c_str());
  fail(error, what, path);
}

}  // namespace os

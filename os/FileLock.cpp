#include "os/FileLock.h"

#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>
#include <cerrno>
#include <system_error>
#include <thread>

namespace os {
namespace {

using Clock = std::chrono::steady_clock;

[[noreturn]] void fail(int error, const std::string& path) {
  throw std::system_error(error, std::generic_category(), "cannot lock " + path);
}

int openLockFile(const std::string& path) {
  constexpr int notWaiting = O_NONBLOCK;  // a pipe of that name
  const int file = open(path.c_str(), O_RDWR | O_CREAT | O_NOFOLLOW | O_CLOEXEC | notWaiting, 0600);
  if (file < 0) fail(errno, path);
  return file;
}

}  // namespace

FileLock::FileLock(const std::string& path, std::chrono::milliseconds timeout) : file_(openLockFile(path)) {
  const Clock::time_point end = Clock::now() + timeout;
  while (flock(file_, LOCK_EX | LOCK_NB) != 0) {
    const int error = errno;
    const bool isHeld = error == EWOULDBLOCK || error == EINTR;
    if (isHeld && Clock::now() < end) {
      std::this_thread::sleep_for(std::chrono::milliseconds(5));
      continue;
    }
    close(file_);
    fail(isHeld ? ETIMEDOUT : error, path);
  }
}

FileLock::~FileLock() {
  close(file_);
}

void FileLock::write(std::string_view text) {
  const bool isWritten = ftruncate(file_, 0) == 0 &&
                         pwrite(file_, text.data(), text.size(), 0) == static_cast<ssize_t>(text.size());
  if (!isWritten) throw std::system_error(errno, std::generic_category(), "cannot write a lock file");
}

}  // namespace os

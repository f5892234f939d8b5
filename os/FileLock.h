// A lock between processes.
#pragma once

#include <chrono>
#include <string>
#include <string_view>

namespace os {

/// Kept from its construction to its end, and released when the process ends, however it ends.
class FileLock {
 public:
  /// Makes the file when there is none, and leaves it there; its folder must exist. A symbolic link is not followed.
  /// Throws std::system_error: std::errc::timed_out when another process has kept the lock all the time.
  FileLock(const std::string& path, std::chrono::milliseconds timeout);
  FileLock(const FileLock&) = delete;
  FileLock& operator=(const FileLock&) = delete;
  ~FileLock();

  /// Makes this the file's whole content. Throws std::system_error.
  void write(std::string_view text);

 private:
  int file_;
};

}  // namespace os

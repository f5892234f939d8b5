// Other programs.
#pragma once

#include <string>
#include <vector>

namespace os {

/// Runs a program of the folders of PATH to its end; the first word is its name. Its standard output is our standard error.
/// Returns its exit status, 128 and the signal that ended it. Throws std::system_error when there is no such program.
int runProgram(const std::vector<std::string>& words);

/// A folder of its own that goes with it, with all that is in it.
class TemporaryFolder {
 public:
  /// Throws std::system_error.
  TemporaryFolder();
  TemporaryFolder(const TemporaryFolder&) = delete;
  TemporaryFolder& operator=(const TemporaryFolder&) = delete;
  ~TemporaryFolder();

  const std::string& path() const { return path_; }

 private:
  std::string path_;
};

}  // namespace os

// The same transfers written the obvious way, a character at a time, as the measure of what the library's way
// gains.
#pragma once

#include <string>
#include <vector>

namespace bench {

/// The image of four ports of one width, and what it takes to move it.
class PlainPorts {
 public:
  explicit PlainPorts(unsigned width);

  /// The data field of a write: values and steps from byte arrays, all bits marked.
  std::string write(const unsigned char* asyncBits, const unsigned char* syncStepBits);

  /// Takes the records out of `result` into the image, and the image into eight byte arrays.
  void read(const std::vector<unsigned char>& result, std::vector<std::vector<unsigned char>>& ports);

 private:
  unsigned width_;
  std::string asyncOut_;
  std::vector<std::string> trains_;
  std::string mask_;
  std::vector<std::string> inputs_;
};

}  // namespace bench

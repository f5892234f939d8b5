// Appends text to a file through a large buffer.
#pragma once

#include <cstdint>
#include <cstdio>
#include <memory>
#include <string>

namespace qor {

class OutputFile {
 public:
  /// "-", or a path that begins with "-.", is standard output. Throws Failure when the file cannot be made.
  explicit OutputFile(const std::string& path);

  std::string& text() { return text_; }

  /// To be called after each poll, with its time: writes the text when there is much of it, or when a second has gone by.
  /// Throws Failure, naming the file.
  void spill(std::uint64_t nanoseconds) {
    if (text_.size() >= bufferSize || nanoseconds - written_ >= longest) write(nanoseconds);
  }

  /// Writes what is left and closes the file. Throws Failure.
  void close();

 private:
  static constexpr std::size_t bufferSize = 1 << 18;
  static constexpr std::uint64_t longest = 1000000000;

  void write(std::uint64_t nanoseconds);
  [[noreturn]] void fail() const;

  std::string path_;
  std::string text_;
  std::uint64_t written_ = 0;
  std::unique_ptr<std::FILE, int (*)(std::FILE*)> file_;
};

}  // namespace qor

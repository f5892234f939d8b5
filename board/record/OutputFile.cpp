#include "board/record/OutputFile.h"

#include <algorithm>
#include <cerrno>
#include <string_view>
#include <system_error>

#include "board/model/Errors.h"

namespace qor {
namespace {

bool isStandardOutput(const std::string& path) {
  return path == "-" || path.rfind("-.", 0) == 0;
}

std::FILE* opened(const std::string& path) {
  return isStandardOutput(path) ? stdout : std::fopen(path.c_str(), "wb");
}

}  // namespace

OutputFile::OutputFile(const std::string& path)
    : path_(path), file_(opened(path), isStandardOutput(path) ? std::fflush : std::fclose) {
  if (file_ == nullptr) fail();
  std::setvbuf(file_.get(), nullptr, _IONBF, 0);  // it is buffered here
  text_.reserve(2 * bufferSize);
}

void OutputFile::write(std::uint64_t nanoseconds) {
  if (std::fwrite(text_.data(), 1, text_.size(), file_.get()) != text_.size()) fail();
  text_.clear();
  written_ = nanoseconds;
}

void OutputFile::close() {
  write(written_);
  const auto finish = file_.get_deleter();
  if (finish(file_.release()) != 0) fail();
}

void OutputFile::fail() const {
  throw FileFailure("cannot write the file " + path_ + ": " + std::generic_category().message(errno));
}

}  // namespace qor

#include "board/record/OutputFile.h"

#include <algorithm>
#include <cerrno>
#include <string_view>
#include <system_error>

#include "board/model/Errors.h"

namespace qor {

OutputFile::OutputFile(const std::string& path)
    : path_(path), file_(std::fopen(path.c_str(), "wb"), std::fclose) {
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
  if (std::fclose(file_.release()) != 0) fail();
}

void OutputFile::fail() const {
  throw FileFailure("cannot write the file " + path_ + ": " + std::generic_category().message(errno));
}

}  // namespace qor

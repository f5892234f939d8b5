#include "board/record/SampleWriter.h"

#include <unistd.h>
#include <algorithm>
#include <cerrno>
#include <string_view>
#include <system_error>

#include "board/model/Errors.h"

namespace qor {

OutputFile::OutputFile(const std::string& path)
    : path_(path), file_(std::fopen(path.c_str(), "wb"), std::fclose) {
  if (file_ == nullptr) fail();
  text_.reserve(2 * bufferSize);
}

void OutputFile::write() {
  for (std::string_view rest = text_; !rest.empty();) {
    const ssize_t count = ::write(fileno(file_.get()), rest.data(), rest.size());
    if (count < 0 && errno != EINTR) fail();
    rest.remove_prefix(static_cast<std::size_t>(std::max<ssize_t>(0, count)));
  }
  text_.clear();
}

void OutputFile::close() {
  write();
  if (std::fclose(file_.release()) != 0) fail();
}

void OutputFile::fail() const {
  throw Failure("cannot write the file " + path_ + ": " + std::generic_category().message(errno));
}

std::unique_ptr<SampleWriter> sampleWriter(const std::string& path) {
  const std::size_t dot = path.rfind('.');
  const std::string ending = dot == path.npos ? "" : path.substr(dot);
  if (ending == ".vcd") return vcdWriter(path);
  if (ending == ".csv") return csvWriter(path);
  if (ending == ".jsonl") return jsonLinesWriter(path);
  throw WrongUse("samples go to .vcd, .csv or .jsonl: " + path);
}

}  // namespace qor

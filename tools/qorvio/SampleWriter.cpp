#include "SampleWriter.h"

#include <cerrno>
#include <system_error>

#include "Errors.h"

namespace tool {

OutputFile::OutputFile(const std::string& path)
    : path_(path), file_(std::fopen(path.c_str(), "wb"), std::fclose) {
  if (file_ == nullptr) fail();
  text_.reserve(2 * bufferSize);
}

void OutputFile::write() {
  if (std::fwrite(text_.data(), 1, text_.size(), file_.get()) != text_.size() ||
      std::fflush(file_.get()) != 0)
    fail();
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

}  // namespace tool

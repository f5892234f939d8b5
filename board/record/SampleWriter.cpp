#include "board/record/SampleWriter.h"

#include "board/model/Errors.h"
#include "board/record/Writers.h"

namespace qor {

SampleWriter::~SampleWriter() = default;

std::unique_ptr<SampleWriter> sampleWriter(const std::string& path) {
  const std::size_t dot = path.rfind('.');
  const std::string ending = path == "-" ? ".csv" : dot == path.npos ? "" : path.substr(dot);
  if (ending == ".vcd") return vcdWriter(path);
  if (ending == ".csv") return csvWriter(path);
  if (ending == ".jsonl") return jsonLinesWriter(path);
  throw WrongUse("samples go to .vcd, .csv or .jsonl: " + path);
}

}  // namespace qor

// CSV and JSON lines: one line a poll, with every value. A value's digits are made only when it changes.
#include <cstdio>

#include <nlohmann/json.hpp>

#include "SampleWriter.h"

namespace tool {
namespace {

void appendSeconds(std::string& text, std::uint64_t nanoseconds) {
  char digits[32];
  const int length = std::snprintf(digits, sizeof digits, "%llu.%09llu",
                                   static_cast<unsigned long long>(nanoseconds / 1000000000),
                                   static_cast<unsigned long long>(nanoseconds % 1000000000));
  text.append(digits, static_cast<std::size_t>(length));
}

// In double quotes where a comma, a quote or a line end would be taken for the table's own.
std::string csvField(const std::string& text) {
  if (text.find_first_of(",\"\r\n") == text.npos) return text;
  std::string quoted = "\"";
  for (char letter : text) quoted.append(letter == '"' ? 2 : 1, letter);
  return quoted + '"';
}

class CsvWriter : public SampleWriter {
 public:
  explicit CsvWriter(const std::string& path) : file_(path) {}

  void begin(const std::vector<Signal>& signals, const std::string&) override {
    signals_ = signals;
    cells_.resize(signals.size());
    file_.text() += "time_s,missed";
    for (const Signal& each : signals) file_.text() += ',' + csvField(each.name);
    file_.text() += '\n';
  }

  void add(const Poll& poll) override {
    for (std::size_t i : poll.changed) cells_[i] = csvField(shown(signals_[i], poll.values[i]));
    appendSeconds(file_.text(), poll.nanoseconds);
    file_.text() += ',';
    file_.text() += std::to_string(poll.missed);
    for (const std::string& cell : cells_) (file_.text() += ',') += cell;
    file_.text() += '\n';
    file_.spill();
  }

  void end() override { file_.close(); }

 private:
  OutputFile file_;
  std::vector<Signal> signals_;
  std::vector<std::string> cells_;
};

class JsonLinesWriter : public SampleWriter {
 public:
  explicit JsonLinesWriter(const std::string& path) : file_(path) {}

  void begin(const std::vector<Signal>& signals, const std::string&) override {
    signals_ = signals;
    cells_.resize(signals.size());
    for (const Signal& each : signals) keys_.push_back(',' + nlohmann::json(each.name).dump() + ':');
  }

  void add(const Poll& poll) override {
    for (std::size_t i : poll.changed) cells_[i] = nlohmann::json(shown(signals_[i], poll.values[i])).dump();
    file_.text() += "{\"time_s\":";
    appendSeconds(file_.text(), poll.nanoseconds);
    file_.text() += ",\"missed\":";
    file_.text() += std::to_string(poll.missed);
    for (std::size_t i = 0; i < cells_.size(); ++i) (file_.text() += keys_[i]) += cells_[i];
    file_.text() += "}\n";
    file_.spill();
  }

  void end() override { file_.close(); }

 private:
  OutputFile file_;
  std::vector<Signal> signals_;
  std::vector<std::string> keys_;
  std::vector<std::string> cells_;
};

}  // namespace

std::unique_ptr<SampleWriter> csvWriter(const std::string& path) {
  return std::make_unique<CsvWriter>(path);
}

std::unique_ptr<SampleWriter> jsonLinesWriter(const std::string& path) {
  return std::make_unique<JsonLinesWriter>(path);
}

}  // namespace tool

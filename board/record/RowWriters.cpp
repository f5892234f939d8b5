// CSV and JSON lines: one line per poll, with every value. A value's digits are made only when it changes.
#include <algorithm>

#include <nlohmann/json.hpp>

#include "board/model/Value.h"
#include "board/record/OutputFile.h"
#include "board/record/Writers.h"

namespace qor {
namespace {

void appendSeconds(std::string& text, std::uint64_t nanoseconds) {
  text += std::to_string(nanoseconds / 1000000000);
  text += ".000000000";
  std::uint64_t rest = nanoseconds % 1000000000;
  for (char* digit = &text.back(); rest != 0; rest /= 10) *digit-- = static_cast<char>('0' + rest % 10);
}

// In double quotes where a comma, a quote or a line end would be taken for the table's own.
std::string csvField(const std::string& text) {
  if (text.find_first_of(",\"\r\n") == text.npos) return text;
  std::string quoted = "\"";
  for (char letter : text) quoted.append(letter == '"' ? 2 : 1, letter);
  return quoted + '"';
}

std::string jsonText(const std::string& text) {
  return nlohmann::json(text).dump();
}

bool isShownInDigits(const Signal& signal) {
  return signal.names.empty() && signal.unit.empty();
}

// A line's cells, kept as one text from poll to poll: a cell that changes and keeps its length is changed in place.
class Row {
 public:
  /// `key` goes before the cell.
  void add(std::string key) { cells_.push_back({std::move(key), {}, 0}); }

  void set(std::size_t i, const std::string& text) {
    Cell& cell = cells_[i];
    isWhole_ = isWhole_ && text.size() == cell.text.size();
    if (isWhole_) std::copy(text.begin(), text.end(), line_.begin() + cell.place);
    cell.text = text;
  }

  const std::string& line() {
    if (!isWhole_) join();
    return line_;
  }

 private:
  struct Cell {
    std::string key;
    std::string text;
    std::ptrdiff_t place;  ///< of the text, in the line
  };

  void join() {
    line_.clear();
    for (Cell& each : cells_) {
      line_ += each.key;
      each.place = static_cast<std::ptrdiff_t>(line_.size());
      line_ += each.text;
    }
    isWhole_ = true;
  }

  std::vector<Cell> cells_;
  std::string line_;
  bool isWhole_ = true;
};

class CsvWriter : public SampleWriter {
 public:
  explicit CsvWriter(const std::string& path) : file_(path) {}

  void begin(const std::vector<Signal>& signals, const std::vector<QOR_CORE_REF>&) override {
    signals_ = signals;
    file_.text() += "time_s,missed";
    for (const Signal& each : signals) {
      file_.text() += ',' + csvField(each.name);
      row_.add(",");
    }
    file_.text() += '\n';
  }

  void add(const Poll& poll) override {
    for (std::size_t i : poll.changed) set(i, poll.values[i]);
    appendPlace(poll.nanoseconds, poll.missed);
    file_.text() += row_.line();
    file_.text() += '\n';
    file_.spill(poll.nanoseconds);
  }

  // A line whose cells are empty.
  void addMissed(std::uint64_t nanoseconds, std::uint64_t missed) override {
    appendPlace(nanoseconds, missed);
    file_.text().append(signals_.size(), ',') += '\n';
  }

  void end() override { file_.close(); }

 private:
  void appendPlace(std::uint64_t nanoseconds, std::uint64_t missed) {
    appendSeconds(file_.text(), nanoseconds);
    file_.text() += ',';
    file_.text() += std::to_string(missed);
  }

  void set(std::size_t i, const Bytes& value) {
    cell_.clear();
    appendShown(cell_, signals_[i], value);
    row_.set(i, isShownInDigits(signals_[i]) ? cell_ : csvField(cell_));
  }

  OutputFile file_;
  std::vector<Signal> signals_;
  Row row_;
  std::string cell_;
};

class JsonLinesWriter : public SampleWriter {
 public:
  explicit JsonLinesWriter(const std::string& path) : file_(path) {}

  void begin(const std::vector<Signal>& signals, const std::vector<QOR_CORE_REF>&) override {
    signals_ = signals;
    for (const Signal& each : signals) row_.add(',' + jsonText(each.name) + ':');
  }

  void add(const Poll& poll) override {
    for (std::size_t i : poll.changed) set(i, poll.values[i]);
    appendPlace(poll.nanoseconds, poll.missed);
    file_.text() += row_.line();
    file_.text() += "}\n";
    file_.spill(poll.nanoseconds);
  }

  void addMissed(std::uint64_t nanoseconds, std::uint64_t missed) override {
    appendPlace(nanoseconds, missed);
    file_.text() += "}\n";
  }

  void end() override { file_.close(); }

 private:
  void appendPlace(std::uint64_t nanoseconds, std::uint64_t missed) {
    file_.text() += "{\"time_s\":";
    appendSeconds(file_.text(), nanoseconds);
    file_.text() += ",\"missed\":";
    file_.text() += std::to_string(missed);
  }

  void set(std::size_t i, const Bytes& value) {
    cell_ = '"';
    appendShown(cell_, signals_[i], value);
    cell_ += '"';
    row_.set(i, isShownInDigits(signals_[i]) ? cell_ : jsonText(shown(signals_[i], value)));
  }

  OutputFile file_;
  std::vector<Signal> signals_;
  Row row_;
  std::string cell_;
};

}  // namespace

std::unique_ptr<SampleWriter> csvWriter(const std::string& path) {
  return std::make_unique<CsvWriter>(path);
}

std::unique_ptr<SampleWriter> jsonLinesWriter(const std::string& path) {
  return std::make_unique<JsonLinesWriter>(path);
}

}  // namespace qor

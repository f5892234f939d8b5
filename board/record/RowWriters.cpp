// CSV and JSON lines: one line per poll, with every value. A value's digits are made only when it changes.
#include <algorithm>

#include <nlohmann/json.hpp>

#include "board/model/CoreAddress.h"
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
  return nlohmann::json(text).dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
}

// As the head says the unit, values are without it.
std::vector<Signal> withoutUnits(std::vector<Signal> signals) {
  for (Signal& each : signals) each.unit.clear();
  return signals;
}

// A line's cells, kept as one text from poll to poll: a cell that changes and keeps its length is changed in place.
class Row {
 public:
  /// `key` goes before the cell.
  void add(std::string key, const std::string& text = {}) { cells_.push_back({std::move(key), text, 0}); }

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
  bool isWhole_ = false;
};

// What both have in common: a column for each value, and after them one for what each signal did.
class RowWriter : public SampleWriter {
 public:
  explicit RowWriter(const std::string& path) : file_(path) {}

  void begin(const Heading& heading) override {
    signals_ = withoutUnits(heading.signals);
    isTriggered_ = !heading.when.empty();
    writeHead(heading);
  }

  void add(const Poll& poll) override {
    for (std::size_t i : poll.changed) row_.set(i, cellOf(signals_[i], poll.values[i]));
    for (std::size_t i : poll.movedOtherwise)
      row_.set(signals_.size() + i, std::string(1, static_cast<char>('0' + (poll.moved[i] & 3))));
    writePlace(poll.nanoseconds, poll.missed, poll.isTrigger);
    file_.text() += row_.line();
    writeEnd();
    file_.spill(poll.nanoseconds);
  }

  void end() override { file_.close(); }

 protected:
  virtual void writeHead(const Heading& heading) = 0;
  virtual void writePlace(std::uint64_t nanoseconds, std::uint64_t missed, bool isTrigger) = 0;
  virtual void writeEnd() = 0;
  virtual const std::string& cellOf(const Signal& signal, const Bytes& value) = 0;

  OutputFile file_;
  std::vector<Signal> signals_;
  Row row_;
  std::string cell_;
  bool isTriggered_ = false;
};

class CsvWriter : public RowWriter {
 public:
  using RowWriter::RowWriter;

  // A line whose cells are empty.
  void addMissed(std::uint64_t nanoseconds, std::uint64_t missed) override {
    writePlace(nanoseconds, missed, false);
    file_.text().append(2 * signals_.size(), ',') += '\n';
  }

 private:
  void writeHead(const Heading& heading) override {
    file_.text() += "time_s,missed";
    if (isTriggered_) file_.text() += ',' + csvField("trigger [" + heading.when + "]");
    for (const Signal& each : heading.signals) {
      file_.text() += ',' + csvField(each.unit.empty() ? each.name : each.name + " [" + each.unit + "]");
      row_.add(",");
    }
    for (const Signal& each : heading.signals) {
      file_.text() += ',' + csvField(each.name + " moved");
      row_.add(",", "0");
    }
    file_.text() += '\n';
  }

  void writePlace(std::uint64_t nanoseconds, std::uint64_t missed, bool isTrigger) override {
    appendSeconds(file_.text(), nanoseconds);
    file_.text() += ',';
    file_.text() += std::to_string(missed);
    if (isTriggered_) file_.text() += isTrigger ? ",1" : ",0";
  }

  void writeEnd() override { file_.text() += '\n'; }

  const std::string& cellOf(const Signal& signal, const Bytes& value) override {
    cell_.clear();
    appendShown(cell_, signal, value);
    if (!signal.names.empty()) cell_ = csvField(cell_);
    return cell_;
  }
};

class JsonLinesWriter : public RowWriter {
 public:
  using RowWriter::RowWriter;

  void addMissed(std::uint64_t nanoseconds, std::uint64_t missed) override {
    writePlace(nanoseconds, missed, false);
    file_.text() += "}\n";
  }

 private:
  void writeHead(const Heading& heading) override {
    nlohmann::ordered_json signals = nlohmann::ordered_json::array();
    for (const Signal& each : heading.signals) {
      signals.push_back(
          {{"name", each.name}, {"core", refText(heading.cores[each.core])}, {"width", each.width()}});
      if (!each.unit.empty()) signals.back()["unit"] = each.unit;
      row_.add(',' + jsonText(each.name) + ':');
    }
    for (const Signal& each : heading.signals)
      row_.add((&each == heading.signals.data() ? R"(,"moved":{)" : ",") + jsonText(each.name) + ':', "0");
    nlohmann::ordered_json head{{"signals", signals}};
    if (isTriggered_) head["when"] = heading.when;
    file_.text() += head.dump(-1, ' ', false, nlohmann::json::error_handler_t::replace) + '\n';
  }

  void writePlace(std::uint64_t nanoseconds, std::uint64_t missed, bool isTrigger) override {
    file_.text() += "{\"time_s\":";
    appendSeconds(file_.text(), nanoseconds);
    file_.text() += ",\"missed\":";
    file_.text() += std::to_string(missed);
    if (isTrigger) file_.text() += ",\"trigger\":true";
  }

  void writeEnd() override { file_.text() += "}}\n"; }

  // Numbers as such: scaled ones, and those of decimal signals.
  const std::string& cellOf(const Signal& signal, const Bytes& value) override {
    cell_.clear();
    const bool isDecimal =
        signal.scale != 0 || signal.radix == Radix::dec || signal.radix == Radix::signedDec;
    if (!signal.names.empty() && enumeratedName(signal, value) != nullptr)
      return cell_ = jsonText(shown(signal, value));
    if (!isDecimal) cell_ = '"';
    appendShown(cell_, signal, value);
    if (!isDecimal) cell_ += '"';
    return cell_;
  }
};

}  // namespace

std::unique_ptr<SampleWriter> csvWriter(const std::string& path) {
  return std::make_unique<CsvWriter>(path);
}

std::unique_ptr<SampleWriter> jsonLinesWriter(const std::string& path) {
  return std::make_unique<JsonLinesWriter>(path);
}

}  // namespace qor

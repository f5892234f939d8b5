#include "board/record/PlayScript.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <fstream>

#include "board/model/Errors.h"

namespace qor {
namespace {

using std::chrono::nanoseconds;
using Fields = std::vector<std::string>;

// Fields of a line; one may stand in double quotes, with two of them for one.
Fields fieldsOf(const std::string& line) {
  Fields fields(1);
  bool quoted = false;
  for (std::size_t i = 0; i < line.size(); ++i) {
    const bool isQuote = line[i] == '"';
    if (isQuote && quoted && i + 1 < line.size() && line[i + 1] == '"') {
      fields.back() += line[++i];
    } else if (isQuote) {
      quoted = !quoted;
    } else if (line[i] == ',' && !quoted) {
      fields.emplace_back();
    } else if (line[i] != '\r') {
      fields.back() += line[i];
    }
  }
  return fields;
}

nanoseconds timeOf(const std::string& text) {
  constexpr double longest = 1e9;  // seconds: thirty years
  double seconds = 0;
  const char* const end = text.data() + text.size();
  const auto [rest, error] = std::from_chars(text.data(), end, seconds);
  if (error != std::errc() || rest != end || !(seconds >= 0) || seconds > longest)
    throw WrongUse("not a time in seconds: " + text);
  return nanoseconds(std::llround(seconds * 1e9));
}

// Takes a script from the lines of its file.
class Reader {
 public:
  explicit Reader(PlayScript& script) : script_(script) {}

  void readNames(const Fields& fields, const SignalTable& signals) {
    isTimed_ = fields.front() == "time_s";
    if (isTimed_) firstValue_ = fields.size() > 1 && fields[1] == "missed" ? 2 : 1;
    // None at all would select every output.
    if (fields.size() == firstValue_) throw WrongUse("names no output");
    script_.signals = signals.select(valuesOf(fields), Direction::output);
  }

  void readRow(const Fields& fields) {
    const std::size_t wanted = script_.signals.size(),
                      given = fields.size() - std::min(firstValue_, fields.size());
    if (given != wanted)
      throw WrongUse(std::to_string(given) + " values for " + std::to_string(wanted) + " outputs");
    if (firstValue_ == 2 && areEmpty(fields)) return;  // the end of a recording that missed its last polls
    if (isTimed_) readTime(fields.front());
    std::vector<Bytes> row;
    row.reserve(wanted);
    for (std::size_t i = 0; i < wanted; ++i)
      row.push_back(parseValue(script_.signals[i], fields[firstValue_ + i]));
    script_.rows.push_back(std::move(row));
  }

 private:
  bool areEmpty(const Fields& fields) const {
    return std::all_of(fields.begin() + static_cast<std::ptrdiff_t>(firstValue_), fields.end(),
                       [](const std::string& field) { return field.empty(); });
  }

  Fields valuesOf(const Fields& fields) const {
    return {fields.begin() + static_cast<std::ptrdiff_t>(firstValue_), fields.end()};
  }

  void readTime(const std::string& text) {
    const nanoseconds time = timeOf(text);
    if (script_.hasTimes() && time < script_.times.back())
      throw WrongUse("a time before that of the row above it: " + text);
    script_.times.push_back(time);
  }

  PlayScript& script_;
  bool isTimed_ = false;
  std::size_t firstValue_ = 0;
};

}  // namespace

PlayScript readPlayScript(const std::string& path, const SignalTable& signals) {
  std::ifstream file(path);
  if (!file) throw WrongUse("cannot read the file: " + path);
  PlayScript script;
  Reader reader(script);
  std::size_t number = 0;
  const auto failAt = [&](std::size_t line, const char* problem) {
    throw WrongUse(path + ":" + std::to_string(line) + ": " + problem);
  };
  for (std::string line; std::getline(file, line);) {
    ++number;
    try {
      number == 1 ? reader.readNames(fieldsOf(line), signals) : reader.readRow(fieldsOf(line));
    } catch (const WrongUse& error) {
      failAt(number, error.what());
    }
  }
  if (script.rows.empty()) failAt(1, "has no row of values below its names");
  return script;
}

}  // namespace qor

#include "board/record/PlayScript.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <system_error>

#include "board/model/Errors.h"
#include "board/model/Value.h"
#include "os/Files.h"

namespace qor {
namespace {

using std::chrono::nanoseconds;
using Fields = std::vector<std::string>;

constexpr std::size_t largestFile = std::size_t{256} << 20;

std::string trimmed(const std::string& text) {
  const std::size_t first = text.find_first_not_of(" \t"), last = text.find_last_not_of(" \t");
  return first == text.npos ? "" : text.substr(first, last - first + 1);
}

// Fields of a line; one may be in double quotes, with two of them for one.
Fields fieldsOf(std::string_view line) {
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
  for (std::string& each : fields) each = trimmed(each);
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
    columns_ = fields.size();
    isTimed_ = fields.front() == "time_s";
    Fields names;
    for (std::size_t i = isTimed_ ? 1 : 0; i < columns_; ++i) {
      if (isTimed_ && isOfRecording(fields[i])) continue;
      names.push_back(fields[i].substr(0, fields[i].find(" [")));
      places_.push_back(i);
    }
    if (names.empty()) throw WrongUse("names no output");  // which would select every one
    script_.signals = signals.select(names, Direction::output);
    requireDistinct(script_.signals);
  }

  void readRow(const Fields& fields) {
    if (fields.size() != columns_)
      throw WrongUse(std::to_string(fields.size()) + " fields below " + std::to_string(columns_) + " names");
    if (isTimed_ && areEmpty(fields)) return;  // the end of a recording that missed its last polls
    if (isTimed_) readTime(fields.front());
    std::vector<Bytes> row;
    row.reserve(places_.size());
    for (std::size_t i = 0; i < places_.size(); ++i)
      row.push_back(parseValue(script_.signals[i], fields[places_[i]]));
    script_.rows.push_back(std::move(row));
  }

 private:
  // Whether record writes such a column beside the values.
  static bool isOfRecording(const std::string& name) {
    constexpr std::string_view moved = " moved";
    const bool isMoved = name.size() > moved.size() && name.substr(name.size() - moved.size()) == moved;
    return name == "missed" || name.rfind("trigger [", 0) == 0 || isMoved;
  }

  bool areEmpty(const Fields& fields) const {
    return std::all_of(places_.begin(), places_.end(),
                       [&](std::size_t place) { return fields[place].empty(); });
  }

  static void requireDistinct(const std::vector<Signal>& signals) {
    std::vector<std::string> names;
    names.reserve(signals.size());
    for (const Signal& each : signals) names.push_back(each.name);
    std::sort(names.begin(), names.end());
    const auto twice = std::adjacent_find(names.begin(), names.end());
    if (twice != names.end()) throw WrongUse("names an output twice: " + *twice);
  }

  void readTime(const std::string& text) {
    const nanoseconds time = timeOf(text);
    if (script_.hasTimes() && time < script_.times.back())
      throw WrongUse("a time before that of the row above it: " + text);
    script_.times.push_back(time);
  }

  PlayScript& script_;
  bool isTimed_ = false;
  std::size_t columns_ = 0;
  std::vector<std::size_t> places_;  // of the values, in a row
};

}  // namespace

PlayScript parsePlayScript(std::string_view text, const std::string& path, const SignalTable& signals) {
  constexpr std::string_view byteOrderMark = "\xEF\xBB\xBF";
  if (text.substr(0, byteOrderMark.size()) == byteOrderMark) text.remove_prefix(byteOrderMark.size());
  PlayScript script;
  Reader reader(script);
  std::size_t number = 0, namesAt = 0;
  const auto failAt = [&](std::size_t line, const char* problem) {
    throw WrongUse(path + ":" + std::to_string(line) + ": " + problem);
  };
  while (!text.empty()) {
    const std::string_view line = text.substr(0, text.find('\n'));
    text.remove_prefix(std::min(line.size() + 1, text.size()));
    ++number;
    if (line.find_first_not_of(" \t\r") == line.npos) continue;
    try {
      namesAt == 0 ? reader.readNames(fieldsOf(line), signals) : reader.readRow(fieldsOf(line));
    } catch (const WrongUse& error) {
      failAt(number, error.what());
    }
    if (namesAt == 0) namesAt = number;
  }
  if (script.rows.empty()) failAt(std::max<std::size_t>(namesAt, 1), "has no row of values below its names");
  return script;
}

PlayScript readPlayScript(const std::string& path, const SignalTable& signals) {
  try {
    return parsePlayScript(os::readFile(path, largestFile), path, signals);
  } catch (const std::system_error& error) {
    throw WrongUse(error.what());
  }
}

}  // namespace qor

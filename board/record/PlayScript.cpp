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
    isTimed_ = fields.front() == "time_s";
    if (isTimed_) firstValue_ = fields.size() > 1 && fields[1] == "missed" ? 2 : 1;
    // None at all would select every output.
    if (fields.size() == firstValue_) throw WrongUse("names no output");
    script_.signals = signals.select(valuesOf(fields), Direction::output);
    requireDistinct(script_.signals);
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

  static void requireDistinct(const std::vector<Signal>& signals) {
    std::vector<std::string> names;
    names.reserve(signals.size());
    for (const Signal& each : signals) names.push_back(each.name);
    std::sort(names.begin(), names.end());
    const auto twice = std::adjacent_find(names.begin(), names.end());
    if (twice != names.end()) throw WrongUse("names an output twice: " + *twice);
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

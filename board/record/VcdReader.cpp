#include "board/record/VcdReader.h"

#include <algorithm>
#include <charconv>
#include <string_view>
#include <system_error>
#include <unordered_map>
#include <utility>

#include "board/model/Errors.h"
#include "os/Files.h"

namespace qor {
namespace {

constexpr std::size_t largestFile = std::size_t{1} << 30;
constexpr std::uint64_t latest = std::uint64_t{1} << 53;  // up to here every time is a double
constexpr unsigned widest = 1 << 20;

std::string contentOf(const std::string& path) {
  try {
    return os::readFile(path, largestFile);
  } catch (const std::system_error& error) {
    throw WrongUse(error.what());
  }
}

char lower(char letter) {
  return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter;
}

class VcdReader {
 public:
  explicit VcdReader(const std::string& path) : path_(path), text_(contentOf(path)) {}

  VcdDump read() {
    for (std::string_view word = next(); !word.empty(); word = next()) take(word);
    if (dump_.variables.empty() || !hasTime_) throw WrongUse("not a value change dump: " + path_);
    return std::move(dump_);
  }

 private:
  // The next word; empty at the end of the file.
  std::string_view next() {
    constexpr std::string_view blanks = " \t\r\n\v\f";
    for (; place_ < text_.size() && blanks.find(text_[place_]) != blanks.npos; ++place_)
      if (text_[place_] == '\n') ++line_;
    const std::size_t begin = place_;
    place_ = std::min(text_.find_first_of(blanks, begin), text_.size());
    return std::string_view(text_).substr(begin, place_ - begin);
  }

  [[noreturn]] void fail(const std::string& problem, std::string_view word) const {
    throw WrongUse(path_ + ":" + std::to_string(line_) + ": " + problem + ": " +
                   std::string(word.substr(0, 80)));
  }

  void take(std::string_view word) {
    const bool holdsChanges = word.rfind("$dump", 0) == 0 || word == "$end";
    if (holdsChanges) return;
    if (word[0] == '$') return takeSection(word);
    if (word[0] == '#') return takeTime(word);
    const char kind = lower(word[0]);
    if (kind != 'b' && kind != 'r') return takeChange(word.substr(0, 1), word.substr(1));
    const std::string_view value = word.substr(1);
    if (kind == 'r') requireReal(value);
    takeChange(value, next(), kind == 'r');
  }

  void takeSection(std::string_view keyword) {
    const std::size_t begin = line_;
    std::vector<std::string_view> words;
    for (std::string_view word = next(); word != "$end"; word = next()) {
      if (word.empty()) line_ = begin;
      if (word.empty()) fail("no $end", keyword);
      if (words.size() < 8) words.push_back(word);  // of a comment nobody needs more
    }
    if (keyword == "$var") takeVariable(words);
    if (keyword == "$timescale") takeTimescale(words);
  }

  void takeVariable(const std::vector<std::string_view>& words) {
    if (words.size() < 4)
      fail("a variable has type, width, identifier and name", words.empty() ? "$var" : words[0]);
    const std::uint64_t width = number(words[1], widest, "a width is 1 to 1048576 bits");
    if (width == 0) fail("a width is 1 to 1048576 bits", words[1]);
    const auto [place, isNew] = signals_.emplace(words[2], dump_.signals.size());
    if (isNew) {
      dump_.signals.emplace_back();
      widths_.push_back(0);
    }
    widths_[place->second] = std::max(widths_[place->second], width);
    dump_.variables.push_back({std::string(words[3]), static_cast<unsigned>(width), place->second});
  }

  void takeTimescale(const std::vector<std::string_view>& words) {
    constexpr std::pair<std::string_view, double> units[] = {{"s", 1},     {"ms", 1e-3},  {"us", 1e-6},
                                                             {"ns", 1e-9}, {"ps", 1e-12}, {"fs", 1e-15}};
    std::string text;
    for (const std::string_view word : words) text += word;
    const std::size_t digits = std::min(text.find_first_not_of("0123456789"), text.size());
    for (const auto& [unit, seconds] : units) {
      if (digits == 0 || text.substr(digits) != unit) continue;
      const std::uint64_t count =
          number(std::string_view(text).substr(0, digits), 100, "a timescale is 1, 10 or 100");
      if (count != 0) dump_.stepSeconds = static_cast<double>(count) * seconds;
      if (count != 0) return;
    }
    fail("not a timescale such as 10 ns", text);
  }

  void takeTime(std::string_view word) {
    const std::uint64_t time = number(word.substr(1), latest - 1, "a time is a number below 2^53");
    if (hasTime_ && time < dump_.end) fail("a time before the one above it", word);
    if (!hasTime_) dump_.begin = time;
    dump_.end = time;
    hasTime_ = true;
  }

  void takeChange(std::string_view value, std::string_view identifier, bool isReal = false) {
    const auto place = signals_.find(identifier);
    if (place == signals_.end())
      fail("no variable has this identifier", identifier.empty() ? value : identifier);
    std::string text(value);
    for (char& digit : text) digit = lower(digit);
    if (!isReal && (text.empty() || text.find_first_not_of("01xz") != text.npos))
      fail("the digits of a value are 0, 1, x and z", value);
    if (!isReal && text.size() > widths_[place->second]) fail("a value wider than its variable", value);
    dump_.signals[place->second].push_back({dump_.end, std::move(text)});
  }

  std::uint64_t number(std::string_view text, std::uint64_t most, const char* rule) const {
    std::uint64_t value = 0;
    const auto [rest, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (error != std::errc() || rest != text.data() + text.size() || value > most) fail(rule, text);
    return value;
  }

  void requireReal(std::string_view text) const {
    double value = 0;
    const auto [rest, error] = std::from_chars(text.data(), text.data() + text.size(), value);
    if (error != std::errc() || rest != text.data() + text.size()) fail("not a real number", text);
  }

  std::string path_;
  std::string text_;
  std::size_t place_ = 0;
  std::size_t line_ = 1;
  VcdDump dump_;
  bool hasTime_ = false;
  std::unordered_map<std::string_view, std::size_t> signals_;  // by identifier
  std::vector<std::uint64_t> widths_;                          // of signals, in bits
};

}  // namespace

VcdDump readVcd(const std::string& path) {
  return VcdReader(path).read();
}

}  // namespace qor

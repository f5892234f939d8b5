#include "board/model/Duration.h"

#include <algorithm>
#include <charconv>
#include <cstdio>
#include <string_view>
#include <utility>

#include "board/model/Errors.h"

namespace qor {

std::chrono::nanoseconds parseDuration(const std::string& text) {
  constexpr std::pair<std::string_view, double> units[] = {
      {"us", 1e3}, {"ms", 1e6}, {"s", 1e9}, {"m", 60e9}, {"h", 3600e9}};
  constexpr double longest = 1e18;  // nanoseconds: thirty years
  double number = 0;
  const auto [rest, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  const std::string_view unit(rest, static_cast<std::size_t>(text.data() + text.size() - rest));
  for (const auto& [name, nanoseconds] : units) {
    if (error != std::errc() || name != unit || !(number >= 0) || number * nanoseconds > longest) continue;
    return std::chrono::nanoseconds(static_cast<std::int64_t>(number * nanoseconds));
  }
  throw WrongUse("not a time such as 100ms, 10s or 2m: " + text);
}

std::string durationText(std::chrono::nanoseconds time) {
  constexpr std::pair<const char*, double> units[] = {{" s", 1e9}, {" ms", 1e6}, {" us", 1e3}};
  const auto number = static_cast<double>(time.count());
  const auto* const unit = std::find_if(std::begin(units), std::end(units) - 1, [&](const auto& each) {
    return number == 0 || number >= each.second;
  });
  char text[40];
  const auto end =
      std::to_chars(text, text + sizeof text, number / unit->second, std::chars_format::general, 6).ptr;
  return std::string(text, end) + unit->first;
}

std::chrono::nanoseconds periodOf(double rate, double fewest, double most) {
  if (rate >= fewest && rate <= most) return std::chrono::nanoseconds(static_cast<std::int64_t>(1e9 / rate));
  char text[100];
  std::snprintf(text, sizeof text, "a rate is %.10g to %.10g a second: %g", fewest, most, rate);
  throw WrongUse(text);
}

}  // namespace qor
